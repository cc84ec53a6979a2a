#include "layout/AlignmentLayout.h"

#include <algorithm>

CAlignmentLayout::CAlignmentLayout(std::vector<CAlignmentRowSource> sources,
                                   const CLinkList& links) {
    for (auto& source : sources) {
        const int length = static_cast<int>(source.sequence.size());
        if (source.entryIndex >= 0) {
            m_rowOfEntry.emplace(source.entryIndex, static_cast<int>(m_rows.size()));
        }
        m_rows.push_back({std::move(source.name), std::move(source.sequence), source.entryIndex,
                          CSegmentRow(length)});
    }
    for (const auto& link : links) {
        for (int k = 0; k < link->MoleculeCount(); ++k) {
            const int row = RowOfEntry(link->Molecule(k));
            if (row < 0)
                continue;
            m_rows[row].segments.AddLinkedSegment(link->Position(k), link->Length(k),
                                                  link->Column());
        }
    }
    for (auto& row : m_rows) {
        row.segments.Complete();
        m_columnCount = std::max(m_columnCount, row.segments.EndColumn());
    }
}

int CAlignmentLayout::IndexOfRow(std::string_view name) const {
    auto it = std::find_if(m_rows.begin(), m_rows.end(),
                           [name](const Row& row) { return row.name == name; });
    return it == m_rows.end() ? -1 : static_cast<int>(it - m_rows.begin());
}

int CAlignmentLayout::RowOfEntry(int entryIndex) const {
    auto it = m_rowOfEntry.find(entryIndex);
    return it == m_rowOfEntry.end() ? -1 : it->second;
}

CDisplaySeq CAlignmentLayout::DisplaySeqOf(int row) const {
    return CDisplaySeq(m_rows[row].segments, m_rows[row].sequence);
}

std::string CAlignmentLayout::TextInColumns(int row, int first, int end) const {
    const std::string text = DisplaySeqOf(row).Text();
    first = std::clamp(first, 0, static_cast<int>(text.size()));
    end = std::clamp(end, first, static_cast<int>(text.size()));
    return text.substr(first, end - first);
}
