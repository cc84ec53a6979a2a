#include "SelectionBroadcast.h"

#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <cstring>

#include "archive/Archive.h"

namespace {
const char kDBusPath[] = "/org/pellam/qrbo/Broadcast";
const char kDBusInterface[] = "org.pellam.qrbo.Broadcast";
const char kDBusSignal[] = "SelectionNotify";

void Serialize(CArchive& ar, CBroadcastRecord& record) {
    ar.XMember(record.sender);
    ar.XMember(record.molecule);
    ar.XMember(record.kind);
    ar.XMember(record.first);
    ar.XMember(record.last);
    ar.XMember(record.reserved);
}
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

std::vector<std::uint8_t> CSelectionBroadcast::Encode(const CBroadcastRecord& record) {
    CArchive ar = CArchive::ForWriting();
    CBroadcastRecord copy = record;
    Serialize(ar, copy);
    return ar.Bytes();
}

std::optional<CBroadcastRecord> CSelectionBroadcast::Decode(const std::uint8_t* data,
                                                            std::size_t size) {
    try {
        CArchive ar = CArchive::ForReading({data, size});
        CBroadcastRecord record;
        Serialize(ar, record);
        return record;
    } catch (const CArchiveException&) {
        return std::nullopt;
    }
}

bool CSelectionBroadcast::Write(CBroadcastRecord record) {
    record.sender = OwnSender();
    const std::vector<std::uint8_t> bytes = Encode(record);
    const std::uint32_t length = static_cast<std::uint32_t>(bytes.size());
    if (!Attach() || length + sizeof length > static_cast<std::size_t>(m_memory.size()) ||
        !m_memory.lock()) {
        return false;
    }
    auto* target = static_cast<std::uint8_t*>(m_memory.data());
    std::memcpy(target, &length, sizeof length);
    std::memcpy(target + sizeof length, bytes.data(), bytes.size());
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

std::optional<CBroadcastRecord> CSelectionBroadcast::Read() {
    if (!Attach() || !m_memory.lock()) {
        return std::nullopt;
    }
    const auto* source = static_cast<const std::uint8_t*>(m_memory.constData());
    std::uint32_t length = 0;
    std::memcpy(&length, source, sizeof length);
    std::optional<CBroadcastRecord> record;
    if (length > 0 && length <= m_memory.size() - sizeof length) {
        record = Decode(source + sizeof length, length);
    }
    m_memory.unlock();
    if (record && record->sender == OwnSender()) {
        record->molecule.clear();
    }
    return record;
}

void CSelectionBroadcast::OnNotify(int sender) {
    if (sender != OwnSender()) {
        emit announced();
    }
}
