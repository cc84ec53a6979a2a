#include "SimBlockSet.h"

#include <algorithm>

namespace {

// Reads or writes a list of owned records; a stored null element is a format error, so a list
// read from a file never holds one.
template <class T>
void SerializeOwnedList(CArchive& ar, std::vector<std::unique_ptr<T>>& items) {
    if (ar.IsLoading())
        items.clear();
    ar.XObjectList(items);
    if (ar.IsLoading() && std::find(items.begin(), items.end(), nullptr) != items.end()) {
        items.clear();
        throw CArchiveException(CArchiveException::genericError,
                                std::string("empty element in a list of ") + T::kClassTag);
    }
}

}  // namespace

void CSimBlockSerialList::Serialize(CArchive& ar) {
    SerializeOwnedList(ar, items);
}

void CSxMolEntrySerialList::Serialize(CArchive& ar) {
    SerializeOwnedList(ar, items);
}

CSimBlockSet::CSimBlockSet(const CSimBlockSet& other) {
    *this = other;
}

CSimBlockSet& CSimBlockSet::operator=(const CSimBlockSet& other) {
    if (this == &other)
        return *this;
    Clear();
    m_cutoff = other.m_cutoff;
    m_minSequences = other.m_minSequences;
    for (const auto& block : other.m_blocks.items) {
        m_blocks.items.push_back(std::make_unique<CSimBlock>(*block));
    }
    for (const auto& entry : other.m_molecules.items)
        AddMolecule(*entry);
    return *this;
}

void CSimBlockSet::SetSearchParameters(int cutoff, int minSequences) {
    m_cutoff = cutoff;
    m_minSequences = minSequences;
}

int CSimBlockSet::AddBlockSorted(std::unique_ptr<CSimBlock> block) {
    auto& blocks = m_blocks.items;
    auto position = std::find_if(blocks.begin(), blocks.end(),
                                 [&](const auto& existing) { return block->IsGreater(*existing); });
    const int index = static_cast<int>(position - blocks.begin());
    blocks.insert(position, std::move(block));
    return index;
}

namespace {

// A stable sort by OrderKey(), descending, on the keys alone: comparing through the pointers
// would reach into every block at each comparison.
void SortInBlockOrder(std::vector<std::unique_ptr<CSimBlock>>& blocks) {
    std::vector<std::pair<std::int64_t, std::size_t>> keys;
    keys.reserve(blocks.size());
    for (std::size_t i = 0; i < blocks.size(); ++i)
        keys.emplace_back(blocks[i]->OrderKey(), i);
    std::stable_sort(keys.begin(), keys.end(),
                     [](const auto& a, const auto& b) { return a.first > b.first; });
    std::vector<std::unique_ptr<CSimBlock>> sorted;
    sorted.reserve(blocks.size());
    for (const auto& key : keys)
        sorted.push_back(std::move(blocks[key.second]));
    blocks = std::move(sorted);
}

}  // namespace

void CSimBlockSet::AddBlocksSorted(std::vector<std::unique_ptr<CSimBlock>> blocks) {
    auto& existing = m_blocks.items;
    auto greater = [](const auto& a, const auto& b) { return a->IsGreater(*b); };
    // In a list in block order each insertion goes after every block that is not smaller, so
    // adding many at once is a stable sort of the new blocks merged behind their equals.
    if (!std::is_sorted(existing.begin(), existing.end(), greater)) {
        for (auto& block : blocks)
            AddBlockSorted(std::move(block));
        return;
    }
    SortInBlockOrder(blocks);
    std::vector<std::unique_ptr<CSimBlock>> merged;
    merged.reserve(existing.size() + blocks.size());
    std::merge(std::make_move_iterator(existing.begin()), std::make_move_iterator(existing.end()),
               std::make_move_iterator(blocks.begin()), std::make_move_iterator(blocks.end()),
               std::back_inserter(merged), greater);
    existing = std::move(merged);
}

CSimBlock* CSimBlockSet::BlockAt(int index) {
    return index >= 0 && index < BlockCount() ? m_blocks.items[index].get() : nullptr;
}

const CSimBlock* CSimBlockSet::BlockAt(int index) const {
    return const_cast<CSimBlockSet*>(this)->BlockAt(index);
}

CSimBlock* CSimBlockSet::FindBlock(int identifier) {
    for (auto& block : m_blocks.items) {
        if (block->Identifier() == identifier)
            return block.get();
    }
    return nullptr;
}

const CSimBlock* CSimBlockSet::FindBlock(int identifier) const {
    return const_cast<CSimBlockSet*>(this)->FindBlock(identifier);
}

int CSimBlockSet::IndexOfBlock(const CSimBlock& block) const {
    for (int i = 0; i < BlockCount(); ++i) {
        if (m_blocks.items[i]->Identifier() == block.Identifier())
            return i;
    }
    return -1;
}

void CSimBlockSet::RemoveBlock(const CSimBlock* block) {
    auto& blocks = m_blocks.items;
    auto position = std::find_if(blocks.begin(), blocks.end(),
                                 [&](const auto& existing) { return existing.get() == block; });
    if (position != blocks.end())
        blocks.erase(position);
}

void CSimBlockSet::ClearBlocks() {
    m_blocks.items.clear();
}

void CSimBlockSet::Clear() {
    ClearBlocks();
    m_molecules.items.clear();
}

const CSxMolEntry* CSimBlockSet::MoleculeAt(int index) const {
    return index >= 0 && index < MoleculeCount() ? m_molecules.items[index].get() : nullptr;
}

void CSimBlockSet::AddMolecule(const CSxMolEntry& entry) {
    m_molecules.items.push_back(std::make_unique<CSxMolEntry>(entry));
}

const CSxMolEntry* CSimBlockSet::FindMolecule(const std::string& key) const {
    return MoleculeAt(IndexOfMolecule(key));
}

int CSimBlockSet::IndexOfMolecule(const std::string& key) const {
    for (int i = 0; i < MoleculeCount(); ++i) {
        if (EntryHasKey(i, key))
            return i;
    }
    return -1;
}

void CSimBlockSet::RemoveMolecule(const std::string& key) {
    const int index = IndexOfMolecule(key);
    if (index >= 0)
        m_molecules.items.erase(m_molecules.items.begin() + index);
}

void CSimBlockSet::ShiftMemberIndices(int removedIndex) {
    for (auto& block : m_blocks.items)
        block->ShiftMembersAbove(removedIndex);
}

bool CSimBlockSet::EntryHasKey(int index, const std::string& key) const {
    const CSxMolEntry* entry = MoleculeAt(index);
    return entry && entry->Key() == key;
}

bool CSimBlockSet::BlockHasMolecule(const CSimBlock& block, const std::string& key) const {
    for (int i = 0; i < block.MemberCount(); ++i) {
        if (EntryHasKey(block.Member(i), key))
            return true;
    }
    return false;
}

int CSimBlockSet::MoleculeUse(const std::string& key) const {
    if (IndexOfMolecule(key) < 0)
        return kNotInSet;
    for (const auto& block : m_blocks.items) {
        if (BlockHasMolecule(*block, key))
            return kInBlocks;
    }
    return kInSetNoBlock;
}

void CSimBlockSet::Serialize(CArchive& ar) {
    ar.XMember(m_cutoff);
    ar.XMember(m_minSequences);
    ar.XData(m_blocks);
    if (ar.IsLoading()) {
        m_molecules.items.clear();
        if (!ar.AtEnd())
            ar.XData(m_molecules);
    } else {
        ar.XData(m_molecules);
    }
}

TB_REGISTER_CLASS(CSimBlockSerialList);
TB_REGISTER_CLASS(CSxMolEntrySerialList);
TB_REGISTER_CLASS(CSimBlockSet);
