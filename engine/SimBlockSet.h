#pragma once
// The blocks of a search, kept in block order, with one molecule entry per molecule that took
// part (block members index the entries) and the cutoff and minimum of the search that made it.

#include <memory>
#include <string>
#include <vector>

#include "SimBlock.h"
#include "SxMolEntry.h"
#include "archive/Archive.h"

// The stored list of a set's blocks.
class CSimBlockSerialList : public CSerializable {
  public:
    TB_CLASS_TAG("SimBlockList")
    std::vector<std::unique_ptr<CSimBlock>> items;
    void Serialize(CArchive& ar) override;
};

// The stored list of a set's molecule entries.
class CSxMolEntrySerialList : public CSerializable {
  public:
    TB_CLASS_TAG("SxMolEntryList")
    std::vector<std::unique_ptr<CSxMolEntry>> items;
    int Count() const { return static_cast<int>(items.size()); }
    void Serialize(CArchive& ar) override;
};

class CSimBlockSet : public CSerializable {
  public:
    TB_CLASS_TAG("SimBlockSet")

    // Molecule use, see MoleculeUse().
    enum MoleculeUseState { kNotInSet = 0, kInSetNoBlock = 1, kInBlocks = 2 };

    CSimBlockSet() = default;
    // Deep copies: blocks keep their identifiers, entries and order are copied.
    CSimBlockSet(const CSimBlockSet& other);
    CSimBlockSet& operator=(const CSimBlockSet& other);
    CSimBlockSet(CSimBlockSet&&) = default;
    CSimBlockSet& operator=(CSimBlockSet&&) = default;

    // Cutoff and minimum sequences of the search that made the set; -1 for a set never searched.
    int Cutoff() const { return m_cutoff; }
    int MinSequences() const { return m_minSequences; }
    void SetSearchParameters(int cutoff, int minSequences);

    // Blocks.
    int BlockCount() const { return static_cast<int>(m_blocks.items.size()); }
    // Inserts before the first block that the new one is greater than (CSimBlock::IsGreater),
    // else appends; returns the index. The set takes ownership.
    int AddBlockSorted(std::unique_ptr<CSimBlock> block);
    // Adds the blocks one after another as AddBlockSorted does, without its quadratic cost when
    // the set is in block order already (as a search's result set is).
    void AddBlocksSorted(std::vector<std::unique_ptr<CSimBlock>> blocks);
    // Null when the index is out of range.
    CSimBlock* BlockAt(int index);
    const CSimBlock* BlockAt(int index) const;
    // The first block with that identifier, or null.
    CSimBlock* FindBlock(int identifier);
    const CSimBlock* FindBlock(int identifier) const;
    // Position of the first block with the same identifier as `block`, or -1.
    int IndexOfBlock(const CSimBlock& block) const;
    // Removes and deletes that very block; nothing when it is not in the set.
    void RemoveBlock(const CSimBlock* block);
    void ClearBlocks();
    // Deletes all blocks and all molecule entries.
    void Clear();

    // Molecule entries. Keys are compared case-sensitively.
    int MoleculeCount() const { return m_molecules.Count(); }
    // Null when the index is out of range.
    const CSxMolEntry* MoleculeAt(int index) const;
    const CSxMolEntrySerialList& Molecules() const { return m_molecules; }
    void AddMolecule(const CSxMolEntry& entry);
    // The first entry with that key, or null / -1.
    const CSxMolEntry* FindMolecule(const std::string& key) const;
    int IndexOfMolecule(const std::string& key) const;
    // Removes the first entry with that key; block member indices are left as they are.
    void RemoveMolecule(const std::string& key);
    // In every block, member indices above `removedIndex` are lowered by one.
    void ShiftMemberIndices(int removedIndex);
    // kNotInSet: no entry has the key; kInSetNoBlock: an entry has it but no block refers to such
    // an entry; kInBlocks: some block has a member whose entry has the key.
    int MoleculeUse(const std::string& key) const;
    // Some member of the block refers to an entry with that key.
    bool BlockHasMolecule(const CSimBlock& block, const std::string& key) const;

    void Serialize(CArchive& ar) override;

  private:
    bool EntryHasKey(int index, const std::string& key) const;

    std::int32_t m_cutoff = -1;
    std::int32_t m_minSequences = -1;
    CSimBlockSerialList m_blocks;
    CSxMolEntrySerialList m_molecules;
};
