#pragma once
// The links in force, ordered by column. Adding a link refuses one that contradicts the order
// of the stretches already linked, merges overlapping links, and compacts the columns so that no
// row gets more gaps than the links need; unlinking removes residues from links and splits them.

#include <memory>
#include <vector>

#include "links/Link.h"

// Shown when a link contradicts the links already made.
inline constexpr const char* kCannotLinkMessage = "Block can not be linked.";

class CLinkList : public CSerializable {
  public:
    TB_CLASS_TAG("LinkList")

    CLinkList() = default;
    // Deep copies.
    CLinkList(const CLinkList& other);
    CLinkList& operator=(const CLinkList& other);
    CLinkList(CLinkList&&) = default;
    CLinkList& operator=(CLinkList&&) = default;

    int Count() const { return static_cast<int>(m_links.size()); }
    bool IsEmpty() const { return m_links.empty(); }
    const CLink& At(int index) const { return *m_links[index]; }
    auto begin() const { return m_links.begin(); }
    auto end() const { return m_links.end(); }

    // Adds `link`: false, with the list unchanged, when it conflicts with a link already there.
    // Otherwise overlapping links are merged into it, an empty result is dropped, and the
    // columns are compacted.
    bool Add(std::unique_ptr<CLink> link);
    // Removes the request's stretches from every link they meet (a residue stays linked only
    // while two molecules share it) and splits those links; true when any link changed.
    bool Unlink(const CLink& request);
    // Takes `molecule` (an entry index) out of every link and lowers the higher indices, as
    // when its molecule entry is removed from the block set.
    void RemoveMolecule(int molecule);
    void RemoveAll() { m_links.clear(); }

    // Recomputes every column as the smallest one at which no row has to run backwards: the
    // largest, over the link's molecules, of position + the largest displacement of an earlier
    // stretch of that molecule (0 when there is none). The list is then sorted by column. False
    // when no layout exists: two stretches of one molecule overlap, or the links order the
    // stretches of some rows in a cycle.
    bool Compact();

    // The number of links, then each link as an owned pointer. Links read back are compacted;
    // links that cannot be laid out are a format error.
    void Serialize(CArchive& ar) override;

    bool operator==(const CLinkList& other) const;

  private:
    void Insert(std::unique_ptr<CLink> link);
    void AbsorbOverlaps(std::unique_ptr<CLink>& added);

    std::vector<std::unique_ptr<CLink>> m_links;
};
