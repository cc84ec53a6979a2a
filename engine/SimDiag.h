#pragma once
// Pairwise hits and multi-molecule diagonals: what the first two phases of a block search find.

#include <cstdint>
#include <vector>

// Molecules `first` < `second` reach the cutoff on the diagonal where position p of `first`
// faces position p + offset of `second`.
struct CSimHit {
    std::int32_t first = 0;
    std::int32_t second = 0;
    std::int32_t offset = 0;
    bool operator==(const CSimHit&) const = default;
};

// Molecules placed on one diagonal: residue p of the first member faces residue p + offsets[t]
// of member t. Members are molecule indices in increasing order; offsets[0] is 0.
struct CSimDiag {
    std::vector<std::uint16_t> members;
    std::vector<std::int32_t> offsets;

    CSimDiag() = default;
    explicit CSimDiag(const CSimHit& hit)
        : members{static_cast<std::uint16_t>(hit.first), static_cast<std::uint16_t>(hit.second)},
          offsets{0, hit.offset} {}
    int MemberCount() const { return static_cast<int>(members.size()); }
    void Append(int member, int offset) {
        members.push_back(static_cast<std::uint16_t>(member));
        offsets.push_back(offset);
    }
    bool operator==(const CSimDiag&) const = default;
};
