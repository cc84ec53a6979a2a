#include "BroadcastRecord.h"

#include "archive/Archive.h"

namespace {

void SerializeMembers(CArchive& ar, CBroadcastRecord& record) {
    ar.XMember(record.sender);
    ar.XMember(record.moleculeName);
    ar.XMember(record.moleculeKind);
    ar.XMember(record.firstPosition);
    ar.XMember(record.lastPosition);
    ar.XMember(record.reserved);
}

}  // namespace

std::vector<std::uint8_t> CBroadcastRecord::ToBytes() const {
    CArchive ar = CArchive::ForWriting();
    CBroadcastRecord copy = *this;
    SerializeMembers(ar, copy);
    return ar.Bytes();
}

CBroadcastRecord CBroadcastRecord::FromBytes(std::span<const std::uint8_t> bytes,
                                             std::int32_t ownSender) {
    CBroadcastRecord record;
    try {
        CArchive ar = CArchive::ForReading(bytes);
        SerializeMembers(ar, record);
    } catch (const CArchiveException&) {
        return CBroadcastRecord{};
    }
    if (record.sender == ownSender)
        record.moleculeName.clear();
    return record;
}
