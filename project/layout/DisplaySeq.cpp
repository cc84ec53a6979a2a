#include "layout/DisplaySeq.h"

#include <cctype>

CDisplaySeq::CDisplaySeq(const CSegmentRow& row, std::string_view sequence) {
    m_text.reserve(static_cast<std::size_t>(row.EndColumn()));
    m_positions.reserve(static_cast<std::size_t>(row.EndColumn()));
    int lastResidue = -1;
    for (const CSeqSegment& segment : row.Segments()) {
        for (int i = 0; i < segment.length; ++i) {
            if (segment.IsGap()) {
                m_text.push_back('-');
                m_positions.push_back(lastResidue);
                continue;
            }
            const int position = segment.position + i;
            char residue = position < static_cast<int>(sequence.size()) ? sequence[position] : ' ';
            if (segment.kind == kLinkedSegment) {
                residue = static_cast<char>(std::toupper(static_cast<unsigned char>(residue)));
            }
            m_text.push_back(residue);
            m_positions.push_back(position);
            lastResidue = position;
        }
    }
}
