#pragma once
// A block link: one stretch of residues per molecule, all placed at the same display column of
// the alignment. Molecules are indices into the block set's molecule entries.

#include <cstdint>

#include "SerialArrays.h"
#include "archive/Archive.h"

class CLink : public CSerializable {
  public:
    TB_CLASS_TAG("Link")
    // The largest column, position, length or molecule index a stored link may hold.
    static constexpr int kMaxValue = 1 << 28;

    CLink() = default;
    explicit CLink(int column) : m_column(column) {}

    int Column() const { return m_column; }
    void SetColumn(int column) { m_column = column; }

    // Appends one molecule's stretch: its first residue (0-based), its residue count, and the
    // shift the link imposed on that row when it was made.
    void AddMolecule(int molecule, int position, int length, int offset);

    int MoleculeCount() const { return static_cast<int>(m_molecules.size()); }
    int Molecule(int index) const { return m_molecules[index]; }
    int Position(int index) const { return m_positions[index]; }
    int Length(int index) const { return m_lengths[index]; }
    int Offset(int index) const { return m_offsets[index]; }
    void SetLength(int index, int length) { m_lengths[index] = length; }
    // Molecule indices above `removed` are lowered by one (its molecule entry was removed).
    void LowerMoleculesAbove(int removed);
    // The index of `molecule` in this link, or -1.
    int IndexOfMolecule(int molecule) const;

    // How many columns the row has gained before the stretch of molecule `index`.
    int Displacement(int index) const { return m_column - m_positions[index]; }
    // True when no molecule contributes a residue.
    bool IsEmpty() const;
    int LongestLength() const;

    // Column, then the positions, lengths and molecules arrays, then the offsets array. A record
    // whose arrays differ in size or hold values out of range is a format error.
    void Serialize(CArchive& ar) override;

    bool operator==(const CLink& other) const;

  private:
    std::int32_t m_column = 0;
    CIntSerialArray m_positions;
    CIntSerialArray m_lengths;
    CIntSerialArray m_molecules;
    CIntSerialArray m_offsets;
};
