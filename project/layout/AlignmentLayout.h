#pragma once
// The rows of the alignment: one per project molecule, laid out by the block links so that
// linked stretches stand in the same display columns.

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "layout/DisplaySeq.h"
#include "layout/SegmentRow.h"
#include "links/LinkList.h"

// What a row is made from.
struct CAlignmentRowSource {
    std::string name;      // the molecule's name
    std::string sequence;  // its residues as stored
    int entryIndex = -1;   // its index among the block set's molecule entries, -1 when absent
};

class CAlignmentLayout {
  public:
    struct Row {
        std::string name;
        std::string sequence;
        int entryIndex;
        CSegmentRow segments;
    };

    CAlignmentLayout() = default;
    // Applies the links in list order: each stretch goes to the row of its molecule entry
    // (stretches of entries without a row are skipped); then every row is completed.
    CAlignmentLayout(std::vector<CAlignmentRowSource> sources, const CLinkList& links);

    int RowCount() const { return static_cast<int>(m_rows.size()); }
    const Row& RowAt(int index) const { return m_rows[index]; }
    // The row with exactly that name (the first one), or -1.
    int IndexOfRow(std::string_view name) const;
    // The row of a molecule entry, or -1.
    int RowOfEntry(int entryIndex) const;
    // The number of display columns: the end of the longest row.
    int ColumnCount() const { return m_columnCount; }

    // The row's displayed text and column positions.
    CDisplaySeq DisplaySeqOf(int row) const;
    // The displayed characters of columns [first, end) that lie inside the row.
    std::string TextInColumns(int row, int first, int end) const;

  private:
    std::vector<Row> m_rows;
    std::unordered_map<int, int> m_rowOfEntry;
    int m_columnCount = 0;
};
