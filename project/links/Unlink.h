#pragma once
// A working copy of one link during an unlink: per molecule, one flag per offset of its
// stretch telling whether that residue is still linked.

#include <memory>
#include <vector>

#include "links/Link.h"

class CUnlink : public CLink {
  public:
    // Every residue of `link` starts out linked.
    explicit CUnlink(const CLink& link);

    // Clears the residues that the request's stretches cover; true when any was cleared.
    bool ClearRequested(const CLink& request);
    // A residue stays linked in a molecule only while another molecule keeps the same offset.
    void ClearUnshared();
    // Each maximal run of offsets linked in the same non-empty set of molecules, as a link of
    // its own at the column where the run begins.
    std::vector<std::unique_ptr<CLink>> Split() const;

  private:
    bool IsLinked(int molecule, int offset) const;

    std::vector<std::vector<char>> m_masks;
};
