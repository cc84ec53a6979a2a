#pragma once
// The selection that the program exchanges with its sibling programs: which residues of which
// molecule are selected. The shell keeps it in a named shared-memory region.

#include <cstdint>
#include <span>
#include <string>
#include <vector>

struct CBroadcastRecord {
    std::int32_t sender = 0;  // identifies the sending program's main window
    std::string moleculeName;
    std::int32_t moleculeKind = 2;  // 2 for protein molecules
    std::int32_t firstPosition = 0;
    std::int32_t lastPosition = 0;
    std::int32_t reserved = 0;

    // The six members in order, through the archive.
    std::vector<std::uint8_t> ToBytes() const;
    // Reads a record from the start of `bytes` (trailing bytes are ignored). A record sent by
    // `ownSender`, or one that cannot be read, gives an empty molecule name.
    static CBroadcastRecord FromBytes(std::span<const std::uint8_t> bytes, std::int32_t ownSender);

    bool operator==(const CBroadcastRecord&) const = default;
};
