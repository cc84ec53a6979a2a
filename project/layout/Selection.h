#pragma once
// Selections in the alignment and what the link, unlink and define-block commands make of them.

#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "SimBlock.h"
#include "layout/AlignmentLayout.h"
#include "links/Link.h"

// One row of a multi-row selection: display columns start .. end - 1 of the row named `name`
// (the end is one past the last selected column; the two may come in either order).
struct ALN_BSEL_ENTRY {
    std::string name;
    int start = 0;
    int end = 0;
    bool operator==(const ALN_BSEL_ENTRY&) const = default;
};

// The entries trimmed at gaps (CSegmentRow::TrimAtGaps), start before end; entries of unknown
// rows or with nothing left are dropped.
std::vector<ALN_BSEL_ENTRY> TrimSelection(const CAlignmentLayout& layout,
                                          std::span<const ALN_BSEL_ENTRY> selection);

// The link that linking the selection asks for: placed at the largest start column, each
// row's column width cut to the second-largest width, converted to residues. Rows of molecules
// outside the block set, repeated rows and rows without residues in the selection take no
// part. Null when fewer than two rows take part or a selected width is 0.
std::unique_ptr<CLink> MakeLinkRequest(const CAlignmentLayout& layout,
                                       std::span<const ALN_BSEL_ENTRY> selection);
// The stretches that unlinking the selection removes (widths not cut). Null when no row takes
// part or a selected width is 0.
std::unique_ptr<CLink> MakeUnlinkRequest(const CAlignmentLayout& layout,
                                         std::span<const ALN_BSEL_ENTRY> selection);

// A block defined on the selection: members (entry indices) and starts in selection order, and
// the width, the fewest residues any row has in its selected columns.
struct CBlockRequest {
    std::vector<std::int32_t> members;
    std::vector<std::int32_t> starts;
    int width = 0;
};
// None when fewer than two rows of block-set molecules are selected or the width would be 0.
std::optional<CBlockRequest> MakeBlockRequest(const CAlignmentLayout& layout,
                                              std::span<const ALN_BSEL_ENTRY> selection);

// Where a block stands on one row: columns [start, end) and the residues it covers there.
struct CBlockRowRange {
    int row;
    int start;
    int end;
    int position;  // first residue
    int length;    // residues
};
// The block's ranges on the rows of the members in `layout` (rows missing from the alignment
// are skipped), in member order. A range runs from the column of the first residue to one past
// the column of the last, so gaps inside it are included.
std::vector<CBlockRowRange> BlockRowRanges(const CAlignmentLayout& alignment,
                                           const CSimBlock& block,
                                           CSimBlock::Layout layout = CSimBlock::kCurrent);

// The selection entry over residues `first` .. `last` (0-based, inclusive, either order) of the
// row named `name`: from the column of the first residue to one past the column of the last.
// None when there is no such row or the residues lie outside its sequence.
std::optional<ALN_BSEL_ENTRY> ResidueSelection(const CAlignmentLayout& layout,
                                               const std::string& name, int first, int last);
