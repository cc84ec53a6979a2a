#include "links/Link.h"

#include <algorithm>

void CLink::AddMolecule(int molecule, int position, int length, int offset) {
    m_molecules.push_back(molecule);
    m_positions.push_back(position);
    m_lengths.push_back(length);
    m_offsets.push_back(offset);
}

void CLink::LowerMoleculesAbove(int removed) {
    for (auto& molecule : m_molecules) {
        if (molecule > removed)
            --molecule;
    }
}

int CLink::IndexOfMolecule(int molecule) const {
    auto it = std::find(m_molecules.begin(), m_molecules.end(), molecule);
    return it == m_molecules.end() ? -1 : static_cast<int>(it - m_molecules.begin());
}

bool CLink::IsEmpty() const {
    return std::all_of(m_lengths.begin(), m_lengths.end(), [](int length) { return length <= 0; });
}

int CLink::LongestLength() const {
    return m_lengths.empty() ? 0 : *std::max_element(m_lengths.begin(), m_lengths.end());
}

void CLink::Serialize(CArchive& ar) {
    ar.XMember(m_column);
    ar.XData(m_positions);
    ar.XData(m_lengths);
    ar.XData(m_molecules);
    ar.XData(m_offsets);
    if (!ar.IsLoading())
        return;
    std::size_t count = m_molecules.size();
    if (m_positions.size() != count || m_lengths.size() != count || m_offsets.size() != count) {
        throw CArchiveException(CArchiveException::genericError, "link arrays differ in size");
    }
    // Bounded so that sums of columns, positions and lengths never overflow.
    auto outOfRange = [](int value) { return value < 0 || value > kMaxValue; };
    if (outOfRange(m_column) || std::any_of(m_positions.begin(), m_positions.end(), outOfRange) ||
        std::any_of(m_lengths.begin(), m_lengths.end(), outOfRange) ||
        std::any_of(m_molecules.begin(), m_molecules.end(), outOfRange) ||
        std::any_of(m_offsets.begin(), m_offsets.end(),
                    [](int value) { return value < -kMaxValue || value > kMaxValue; })) {
        throw CArchiveException(CArchiveException::genericError, "link value out of range");
    }
}

bool CLink::operator==(const CLink& other) const {
    return m_column == other.m_column && m_positions == other.m_positions &&
           m_lengths == other.m_lengths && m_molecules == other.m_molecules &&
           m_offsets == other.m_offsets;
}

TB_REGISTER_CLASS(CLink);
