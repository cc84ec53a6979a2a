#include "layout/Selection.h"

#include <algorithm>
#include <functional>

namespace {

// A selected row of a molecule that took part in the search.
struct SelectedRow {
    int row;
    int entry;
    int start;  // first selected column
    int width;  // selected columns
};

std::vector<SelectedRow> SelectedRows(const CAlignmentLayout& layout,
                                      std::span<const ALN_BSEL_ENTRY> selection) {
    std::vector<SelectedRow> rows;
    for (const ALN_BSEL_ENTRY& entry : selection) {
        const int row = layout.IndexOfRow(entry.name);
        if (row < 0)
            continue;
        const int molecule = layout.RowAt(row).entryIndex;
        const bool repeated =
            std::any_of(rows.begin(), rows.end(),
                        [molecule](const SelectedRow& r) { return r.entry == molecule; });
        if (molecule < 0 || repeated)
            continue;
        rows.push_back(
            {row, molecule, std::min(entry.start, entry.end), std::abs(entry.end - entry.start)});
    }
    return rows;
}

bool AnyEmpty(const std::vector<SelectedRow>& rows) {
    return std::any_of(rows.begin(), rows.end(), [](const SelectedRow& r) { return r.width <= 0; });
}

// A link at the largest start column with each row's residues in its selected columns.
std::unique_ptr<CLink> MakeRequest(const CAlignmentLayout& layout,
                                   const std::vector<SelectedRow>& rows, std::size_t minRows) {
    if (rows.size() < minRows || AnyEmpty(rows))
        return nullptr;
    int column = 0;
    for (const SelectedRow& r : rows)
        column = std::max(column, r.start);
    auto link = std::make_unique<CLink>(column);
    for (const SelectedRow& r : rows) {
        const CSegmentRow& segments = layout.RowAt(r.row).segments;
        const int residues = segments.ResiduesInColumns(r.start, r.start + r.width);
        if (residues <= 0)
            continue;
        link->AddMolecule(r.entry, segments.ColumnToPosition(r.start), residues, column - r.start);
    }
    if (static_cast<std::size_t>(link->MoleculeCount()) < minRows)
        return nullptr;
    return link;
}

}  // namespace

std::vector<ALN_BSEL_ENTRY> TrimSelection(const CAlignmentLayout& layout,
                                          std::span<const ALN_BSEL_ENTRY> selection) {
    std::vector<ALN_BSEL_ENTRY> trimmed;
    for (const ALN_BSEL_ENTRY& entry : selection) {
        const int row = layout.IndexOfRow(entry.name);
        if (row < 0)
            continue;
        int start = std::min(entry.start, entry.end);
        int end = std::max(entry.start, entry.end);
        if (start < end && layout.RowAt(row).segments.TrimAtGaps(start, end)) {
            trimmed.push_back({entry.name, start, end});
        }
    }
    return trimmed;
}

std::unique_ptr<CLink> MakeLinkRequest(const CAlignmentLayout& layout,
                                       std::span<const ALN_BSEL_ENTRY> selection) {
    std::vector<SelectedRow> rows = SelectedRows(layout, selection);
    if (rows.size() < 2 || AnyEmpty(rows))
        return nullptr;
    // The linked width never exceeds what two rows share.
    std::vector<int> widths;
    for (const SelectedRow& r : rows)
        widths.push_back(r.width);
    std::nth_element(widths.begin(), widths.begin() + 1, widths.end(), std::greater<>());
    for (SelectedRow& r : rows)
        r.width = std::min(r.width, widths[1]);
    return MakeRequest(layout, rows, 2);
}

std::unique_ptr<CLink> MakeUnlinkRequest(const CAlignmentLayout& layout,
                                         std::span<const ALN_BSEL_ENTRY> selection) {
    return MakeRequest(layout, SelectedRows(layout, selection), 1);
}

std::optional<CBlockRequest> MakeBlockRequest(const CAlignmentLayout& layout,
                                              std::span<const ALN_BSEL_ENTRY> selection) {
    const std::vector<SelectedRow> rows = SelectedRows(layout, selection);
    if (rows.size() < 2)
        return std::nullopt;
    CBlockRequest request;
    request.width = -1;
    for (const SelectedRow& r : rows) {
        const CSegmentRow& segments = layout.RowAt(r.row).segments;
        const int residues = segments.ResiduesInColumns(r.start, r.start + r.width);
        request.width = request.width < 0 ? residues : std::min(request.width, residues);
        request.members.push_back(r.entry);
        request.starts.push_back(segments.ColumnToPosition(r.start));
    }
    if (request.width <= 0)
        return std::nullopt;
    return request;
}

std::vector<CBlockRowRange> BlockRowRanges(const CAlignmentLayout& alignment,
                                           const CSimBlock& block, CSimBlock::Layout layout) {
    std::vector<CBlockRowRange> ranges;
    const int width = block.Width(layout);
    if (width <= 0)
        return ranges;
    for (int i = 0; i < block.MemberCount(); ++i) {
        const int row = alignment.RowOfEntry(block.Member(i));
        if (!block.InLayout(layout, i) || row < 0)
            continue;
        const CSegmentRow& segments = alignment.RowAt(row).segments;
        const int position = block.Start(layout, i);
        ranges.push_back({row, segments.PositionToColumn(position),
                          segments.PositionToColumn(position + width - 1) + 1, position, width});
    }
    return ranges;
}

std::optional<ALN_BSEL_ENTRY> ResidueSelection(const CAlignmentLayout& layout,
                                               const std::string& name, int first, int last) {
    const int row = layout.IndexOfRow(name);
    if (row < 0)
        return std::nullopt;
    const CSegmentRow& segments = layout.RowAt(row).segments;
    const int low = std::min(first, last);
    const int high = std::max(first, last);
    if (low < 0 || high >= segments.SequenceLength())
        return std::nullopt;
    return ALN_BSEL_ENTRY{name, segments.PositionToColumn(low),
                          segments.PositionToColumn(high) + 1};
}
