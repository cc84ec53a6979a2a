#pragma once
// Residue selections exchanged with sibling programs: one record in the shared memory named
// "QRBO_BROADCAST_FILE_NAME" (guarded by its system semaphore), announced by a signal on the
// D-Bus session bus when there is one.

#include <QObject>
#include <QSharedMemory>
#include <cstdint>

#include "BroadcastRecord.h"

class CSelectionBroadcast : public QObject {
    Q_OBJECT
  public:
    static constexpr char kSharedMemoryName[] = "QRBO_BROADCAST_FILE_NAME";
    static constexpr int kSharedMemorySize = 4096;

    explicit CSelectionBroadcast(QObject* parent = nullptr);

    // This program's sender id.
    std::int32_t OwnSender() const;
    // Writes the record (with this program as sender) and announces it.
    bool Write(CBroadcastRecord record);
    // The record in shared memory; a record this program sent, or none at all, reads with an
    // empty molecule name.
    CBroadcastRecord Read();

  signals:
    // Another program announced a record.
    void announced();

  private slots:
    void OnNotify(int sender);

  private:
    bool Attach();

    QSharedMemory m_memory;
};
