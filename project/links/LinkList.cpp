#include "links/LinkList.h"

#include <algorithm>
#include <map>
#include <optional>
#include <queue>

#include "links/Unlink.h"

namespace {

// How the added stretch of one molecule lies against the existing stretch of that molecule.
enum class Placement { before, overlapping, after };

Placement Classify(int addedPosition, int addedLength, int existingPosition, int existingLength) {
    if (addedPosition >= existingPosition + existingLength)
        return Placement::after;
    if (existingPosition < addedPosition + addedLength)
        return Placement::overlapping;
    return Placement::before;
}

// Two links conflict when their stretches in the molecules they share do not lie in one order:
// the added link must come wholly before the existing one, or wholly after it, or overlap it
// by the same offset in every overlapping molecule. When it overlaps, an existing stretch that
// the added one follows must end within that offset, or its rest could not be taken over.
// Stretches without residues take no part.
bool Conflicts(const CLink& existing, const CLink& added) {
    bool before = false;
    bool after = false;
    bool overlap = false;
    int overlapOffset = 0;
    int longestAfter = 0;
    for (int i = 0; i < existing.MoleculeCount(); ++i) {
        const int j = added.IndexOfMolecule(existing.Molecule(i));
        if (j < 0 || existing.Length(i) <= 0 || added.Length(j) <= 0)
            continue;
        switch (Classify(added.Position(j), added.Length(j), existing.Position(i),
                         existing.Length(i))) {
            case Placement::before:
                before = true;
                break;
            case Placement::after:
                after = true;
                longestAfter = std::max(longestAfter, existing.Length(i));
                break;
            case Placement::overlapping: {
                const int offset = added.Position(j) - existing.Position(i);
                if (overlap && offset != overlapOffset)
                    return true;
                overlap = true;
                overlapOffset = offset;
                break;
            }
        }
    }
    if (before)
        return after || overlap;
    return overlap && after && longestAfter > overlapOffset;
}

// The first shared molecule in which one stretch starts inside the other.
struct Overlap {
    bool addedStartsInside;  // else the existing stretch starts inside the added one
    int offset;              // residues from the outer stretch's start to the inner one's
    int existingIndex;
    int addedIndex;
};

std::optional<Overlap> FindOverlap(const CLink& existing, const CLink& added) {
    for (int i = 0; i < existing.MoleculeCount(); ++i) {
        const int j = added.IndexOfMolecule(existing.Molecule(i));
        if (j < 0 || existing.Length(i) <= 0 || added.Length(j) <= 0)
            continue;
        const int existingStart = existing.Position(i);
        const int addedStart = added.Position(j);
        if (existingStart <= addedStart && addedStart < existingStart + existing.Length(i)) {
            return Overlap{true, addedStart - existingStart, i, j};
        }
        if (addedStart < existingStart && existingStart < addedStart + added.Length(j)) {
            return Overlap{false, existingStart - addedStart, i, j};
        }
    }
    return std::nullopt;
}

// Cuts every stretch of `from` to `offset` residues and hands what lies beyond to `into`: a
// molecule `into` already has keeps the longer of the two lengths, any other is appended with
// `appendedOffset` as its shift.
//
// Lengths count residues of the molecule, never alignment columns. Within one link every stretch
// is an ungapped run of residues starting at the link's column, so `offset` residues of the
// molecule through which the overlap was found are also `offset` columns of the link, and the
// part beyond it is exactly the residues from position + offset on, whatever gaps the alignment
// showed inside the selection that made the other link.
void TakeOverTail(CLink& from, CLink& into, int offset, int appendedOffset) {
    for (int k = 0; k < from.MoleculeCount(); ++k) {
        const int rest = from.Length(k) - offset;
        if (rest <= 0)
            continue;
        const int m = into.IndexOfMolecule(from.Molecule(k));
        if (m >= 0) {
            into.SetLength(m, std::max(into.Length(m), rest));
        } else {
            into.AddMolecule(from.Molecule(k), from.Position(k) + offset, rest, appendedOffset);
        }
        from.SetLength(k, offset);
    }
}

}  // namespace

CLinkList::CLinkList(const CLinkList& other) {
    *this = other;
}

CLinkList& CLinkList::operator=(const CLinkList& other) {
    if (this == &other)
        return *this;
    m_links.clear();
    for (const auto& link : other.m_links)
        m_links.push_back(std::make_unique<CLink>(*link));
    return *this;
}

bool CLinkList::Add(std::unique_ptr<CLink> link) {
    if (!link)
        return false;
    for (const auto& existing : m_links) {
        if (Conflicts(*existing, *link))
            return false;
    }
    // Worked on a copy: links that would order some row's stretches in a cycle are refused too.
    CLinkList result(*this);
    result.AbsorbOverlaps(link);
    if (!link->IsEmpty())
        result.Insert(std::move(link));
    if (!result.Compact())
        return false;
    *this = std::move(result);
    return true;
}

void CLinkList::AbsorbOverlaps(std::unique_ptr<CLink>& added) {
    for (auto it = m_links.begin(); it != m_links.end();) {
        if (auto overlap = FindOverlap(**it, *added)) {
            if (overlap->addedStartsInside) {
                TakeOverTail(**it, *added, overlap->offset, added->Offset(overlap->addedIndex));
            } else {
                // The existing link keeps the added link's tail and goes in as the merged link;
                // the added link's head stays in the list.
                TakeOverTail(*added, **it, overlap->offset, (*it)->Offset(overlap->existingIndex));
                std::swap(*it, added);
            }
        }
        if ((*it)->IsEmpty()) {
            it = m_links.erase(it);
        } else {
            ++it;
        }
    }
}

void CLinkList::Insert(std::unique_ptr<CLink> link) {
    auto it =
        std::upper_bound(m_links.begin(), m_links.end(), link->Column(),
                         [](int column, const auto& other) { return column < other->Column(); });
    m_links.insert(it, std::move(link));
}

bool CLinkList::Unlink(const CLink& request) {
    std::vector<std::unique_ptr<CLink>> kept;
    std::vector<std::unique_ptr<CLink>> pieces;
    for (auto& link : m_links) {
        CUnlink work(*link);
        if (!work.ClearRequested(request)) {
            kept.push_back(std::move(link));
            continue;
        }
        work.ClearUnshared();
        for (auto& piece : work.Split())
            pieces.push_back(std::move(piece));
    }
    const bool changed = kept.size() != m_links.size();
    m_links = std::move(kept);
    for (auto& piece : pieces)
        Insert(std::move(piece));
    // Fewer or shorter stretches never make a cycle or an overlap: compacting cannot fail here.
    if (changed)
        Compact();
    return changed;
}

void CLinkList::RemoveMolecule(int molecule) {
    CLink request;
    request.AddMolecule(molecule, 0, CLink::kMaxValue, 0);
    Unlink(request);
    for (auto& link : m_links)
        link->LowerMoleculesAbove(molecule);
}

bool CLinkList::Compact() {
    // A link depends on the link holding the previous stretch of each of its molecules; its
    // column follows once those are placed (Kahn's topological order).
    struct Stretch {
        int position;
        int end;
        int link;
        bool operator<(const Stretch& other) const { return position < other.position; }
    };
    const int count = Count();
    std::map<int, std::vector<Stretch>> stretches;  // by molecule
    for (int l = 0; l < count; ++l) {
        const CLink& link = *m_links[l];
        for (int k = 0; k < link.MoleculeCount(); ++k) {
            if (link.Length(k) <= 0)
                continue;
            stretches[link.Molecule(k)].push_back(
                {link.Position(k), link.Position(k) + link.Length(k), l});
        }
    }
    std::vector<std::vector<int>> successors(count);
    std::vector<int> pending(count, 0);
    for (auto& [molecule, list] : stretches) {
        std::stable_sort(list.begin(), list.end());
        for (std::size_t s = 1; s < list.size(); ++s) {
            // Two stretches sharing residues of one row cannot both be laid out.
            if (list[s - 1].end > list[s].position)
                return false;
            successors[list[s - 1].link].push_back(list[s].link);
            ++pending[list[s].link];
        }
    }
    // The displacement of the previous stretch of each molecule, once its link is placed.
    std::vector<std::map<int, int>> previousDisplacement(count);
    std::queue<int> ready;
    for (int l = 0; l < count; ++l) {
        if (pending[l] == 0)
            ready.push(l);
    }
    int placed = 0;
    while (!ready.empty()) {
        CLink& link = *m_links[ready.front()];
        const int l = ready.front();
        ready.pop();
        ++placed;
        int column = 0;
        for (int k = 0; k < link.MoleculeCount(); ++k) {
            if (link.Length(k) <= 0)
                continue;
            auto previous = previousDisplacement[l].find(link.Molecule(k));
            const int displacement =
                previous == previousDisplacement[l].end() ? 0 : previous->second;
            column = std::max(column, link.Position(k) + displacement);
        }
        link.SetColumn(column);
        for (int next : successors[l]) {
            const CLink& follower = *m_links[next];
            for (int k = 0; k < link.MoleculeCount(); ++k) {
                if (link.Length(k) > 0 && follower.IndexOfMolecule(link.Molecule(k)) >= 0) {
                    int& displacement = previousDisplacement[next][link.Molecule(k)];
                    displacement = std::max(displacement, link.Displacement(k));
                }
            }
            if (--pending[next] == 0)
                ready.push(next);
        }
    }
    std::stable_sort(m_links.begin(), m_links.end(),
                     [](const auto& a, const auto& b) { return a->Column() < b->Column(); });
    return placed == count;
}

void CLinkList::Serialize(CArchive& ar) {
    if (ar.IsLoading())
        m_links.clear();
    ar.XObjectList(m_links);
    if (!ar.IsLoading())
        return;
    for (const auto& link : m_links) {
        if (!link)
            throw CArchiveException(CArchiveException::genericError, "missing link");
    }
    if (!Compact()) {
        throw CArchiveException(CArchiveException::genericError,
                                "links overlap or contradict each other");
    }
}

bool CLinkList::operator==(const CLinkList& other) const {
    return std::equal(m_links.begin(), m_links.end(), other.m_links.begin(), other.m_links.end(),
                      [](const auto& a, const auto& b) { return *a == *b; });
}

TB_REGISTER_CLASS(CLinkList);
