#include "SelectionBroadcast.h"

#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <cstring>

namespace {
const char kDBusPath[] = "/org/pellam/qrbo/Broadcast";
const char kDBusInterface[] = "org.pellam.qrbo.Broadcast";
const char kDBusSignal[] = "SelectionNotify";
}  // namespace

CSelectionBroadcast::CSelectionBroadcast(QObject* parent)
    : QObject(parent), m_memory(QString::fromLatin1(kSharedMemoryName)) {
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (bus.isConnected()) {
        bus.connect(QString(), QString::fromLatin1(kDBusPath), QString::fromLatin1(kDBusInterface),
                    QString::fromLatin1(kDBusSignal), this, SLOT(OnNotify(int)));
    }
}

std::int32_t CSelectionBroadcast::OwnSender() const {
    return static_cast<std::int32_t>(QCoreApplication::applicationPid());
}

bool CSelectionBroadcast::Attach() {
    return m_memory.isAttached() || m_memory.attach() || m_memory.create(kSharedMemorySize);
}

bool CSelectionBroadcast::Write(CBroadcastRecord record) {
    record.sender = OwnSender();
    const std::vector<std::uint8_t> bytes = record.ToBytes();
    if (!Attach() || bytes.size() > static_cast<std::size_t>(m_memory.size()) || !m_memory.lock()) {
        return false;
    }
    std::memcpy(m_memory.data(), bytes.data(), bytes.size());
    m_memory.unlock();

    QDBusConnection bus = QDBusConnection::sessionBus();
    if (bus.isConnected()) {
        QDBusMessage message = QDBusMessage::createSignal(QString::fromLatin1(kDBusPath),
                                                          QString::fromLatin1(kDBusInterface),
                                                          QString::fromLatin1(kDBusSignal));
        message << record.sender;
        bus.send(message);
    }
    return true;
}

CBroadcastRecord CSelectionBroadcast::Read() {
    if (!Attach() || !m_memory.lock()) {
        return {};
    }
    const auto* source = static_cast<const std::uint8_t*>(m_memory.constData());
    const CBroadcastRecord record = CBroadcastRecord::FromBytes(
        {source, static_cast<std::size_t>(m_memory.size())}, OwnSender());
    m_memory.unlock();
    return record;
}

void CSelectionBroadcast::OnNotify(int sender) {
    if (sender != OwnSender()) {
        emit announced();
    }
}
