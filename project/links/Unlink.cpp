#include "links/Unlink.h"

#include <algorithm>

CUnlink::CUnlink(const CLink& link) : CLink(link) {
    const int longest = LongestLength();
    for (int k = 0; k < MoleculeCount(); ++k) {
        std::vector<char> mask(static_cast<std::size_t>(longest), 0);
        std::fill_n(mask.begin(), std::max(Length(k), 0), 1);
        m_masks.push_back(std::move(mask));
    }
}

bool CUnlink::IsLinked(int molecule, int offset) const {
    return m_masks[molecule][offset] != 0;
}

bool CUnlink::ClearRequested(const CLink& request) {
    bool cleared = false;
    for (int k = 0; k < MoleculeCount(); ++k) {
        const int j = request.IndexOfMolecule(Molecule(k));
        if (j < 0)
            continue;
        const int first = std::max(Position(k), request.Position(j));
        const int end = std::min(Position(k) + Length(k), request.Position(j) + request.Length(j));
        for (int position = first; position < end; ++position) {
            char& flag = m_masks[k][position - Position(k)];
            cleared = cleared || flag != 0;
            flag = 0;
        }
    }
    return cleared;
}

void CUnlink::ClearUnshared() {
    for (int offset = 0; offset < LongestLength(); ++offset) {
        int holder = -1;
        int holders = 0;
        for (int k = 0; k < MoleculeCount(); ++k) {
            if (IsLinked(k, offset)) {
                holder = k;
                ++holders;
            }
        }
        if (holders == 1)
            m_masks[holder][offset] = 0;
    }
}

std::vector<std::unique_ptr<CLink>> CUnlink::Split() const {
    auto setAt = [this](int offset) {
        std::vector<char> set;
        for (int k = 0; k < MoleculeCount(); ++k)
            set.push_back(m_masks[k][offset]);
        return set;
    };
    std::vector<std::unique_ptr<CLink>> pieces;
    const int longest = LongestLength();
    for (int first = 0; first < longest;) {
        const std::vector<char> set = setAt(first);
        int end = first + 1;
        while (end < longest && setAt(end) == set)
            ++end;
        if (std::find(set.begin(), set.end(), 1) != set.end()) {
            auto piece = std::make_unique<CLink>(Column() + first);
            for (int k = 0; k < MoleculeCount(); ++k) {
                if (set[k])
                    piece->AddMolecule(Molecule(k), Position(k) + first, end - first, Offset(k));
            }
            pieces.push_back(std::move(piece));
        }
        first = end;
    }
    return pieces;
}
