// Blocks and block sets: layouts, scores, the block order, molecule entries and storage.

#include <gtest/gtest.h>

#include <random>

#include "ScoreMatrix.h"
#include "SimBlockSet.h"

namespace {

std::unique_ptr<CSimBlock> MakeBlock(std::vector<std::int32_t> members,
                                     std::vector<std::int32_t> starts, int width, int score) {
    auto block = std::make_unique<CSimBlock>();
    block->Init(members, starts, width, score, 0);
    return block;
}

std::vector<std::uint8_t> Store(CSerializable& object) {
    CArchive ar = CArchive::ForWriting();
    object.Serialize(ar);
    return ar.Bytes();
}

template <class T>
void Load(const std::vector<std::uint8_t>& bytes, T& object) {
    CArchive ar = CArchive::ForReading(bytes);
    object.Serialize(ar);
}

TEST(SimBlock, CurrentLayoutFollowsIncludedMembersAndTheirStarts) {
    auto block = MakeBlock({0, 2, 5, 7}, {12, 3, 40, 8}, 10, 60);
    EXPECT_TRUE(block->IsUnedited());
    EXPECT_EQ(block->SequenceCount(CSimBlock::kCurrent), 4);
    EXPECT_EQ(block->HighestStart(CSimBlock::kCurrent), 40);
    EXPECT_EQ(block->LowestStart(CSimBlock::kCurrent), 3);
    EXPECT_DOUBLE_EQ(block->MeanPairScore(CSimBlock::kOriginal), 10.0);

    block->SetIncluded(2, false);
    block->SetIncluded(1, false);
    block->SetCurrentStart(0, 14);
    EXPECT_FALSE(block->IsUnedited());
    EXPECT_EQ(block->SequenceCount(CSimBlock::kCurrent), 2);
    EXPECT_EQ(block->SequenceCount(CSimBlock::kOriginal), 4);
    EXPECT_EQ(block->HighestStart(CSimBlock::kCurrent), 14);
    EXPECT_EQ(block->LowestStart(CSimBlock::kCurrent), 8);
    EXPECT_EQ(block->HighestStart(CSimBlock::kOriginal), 40);

    block->SetIncluded(0, false);
    EXPECT_DOUBLE_EQ(block->MeanPairScore(CSimBlock::kCurrent), 0.0);
    block->SetIncluded(3, false);
    EXPECT_EQ(block->LowestStart(CSimBlock::kCurrent), -1);
    EXPECT_EQ(block->HighestStart(CSimBlock::kCurrent), 0);

    block->ResetCurrentLayout();
    EXPECT_TRUE(block->IsUnedited());
    block->SetCurrentWidth(11);
    EXPECT_FALSE(block->IsUnedited());
    block->ResetCurrentLayout();
    block->SetCurrentScore(59);
    EXPECT_FALSE(block->IsUnedited());
}

TEST(SimBlock, IdentifiersAreUniqueAndCopiesKeepThem) {
    CSimBlock first;
    CSimBlock second;
    EXPECT_NE(first.Identifier(), second.Identifier());
    CSimBlock copy = first;
    EXPECT_EQ(copy.Identifier(), first.Identifier());
    EXPECT_TRUE(copy == first);
    second = first;
    EXPECT_TRUE(second == first);
}

TEST(SimBlock, EqualityComparesEveryField) {
    auto original = MakeBlock({0, 1}, {4, 5}, 6, 20);
    const std::vector<std::function<void(CSimBlock&)>> edits = {
        [](CSimBlock& b) { b.SetName("x"); },
        [](CSimBlock& b) { b.SetColour(0x0000FF); },
        [](CSimBlock& b) { b.SetFlag(1); },
        [](CSimBlock& b) { b.SetCurrentWidth(7); },
        [](CSimBlock& b) { b.SetCurrentScore(21); },
        [](CSimBlock& b) { b.SetCurrentStart(1, 6); },
        [](CSimBlock& b) { b.SetIncluded(0, false); },
        [](CSimBlock& b) { b.ShiftMembersAbove(0); },
        [](CSimBlock& b) {
            b.Init(std::vector<std::int32_t>{0, 1}, std::vector<std::int32_t>{4, 6}, 6, 20, 0);
        },
    };
    for (std::size_t i = 0; i < edits.size(); ++i) {
        CSimBlock changed = *original;
        edits[i](changed);
        EXPECT_FALSE(changed == *original) << "edit " << i;
    }
    CSimBlock other;  // same content, another identifier
    other.Init(std::vector<std::int32_t>{0, 1}, std::vector<std::int32_t>{4, 5}, 6, 20, 0);
    EXPECT_FALSE(other == *original);
}

TEST(SimBlockSet, BlocksAreOrderedByMembersThenScoreAndEqualOnesKeepTheirOrder) {
    CSimBlockSet set;
    EXPECT_EQ(set.AddBlockSorted(MakeBlock({0, 1, 2}, {0, 0, 0}, 5, 30)), 0);
    EXPECT_EQ(set.AddBlockSorted(MakeBlock({0, 1, 3}, {0, 0, 0}, 5, 40)), 0);
    auto equal = MakeBlock({1, 2, 3}, {0, 0, 0}, 5, 30);
    const int equalId = equal->Identifier();
    EXPECT_EQ(set.AddBlockSorted(std::move(equal)), 2);  // after the first block of score 30
    EXPECT_EQ(set.AddBlockSorted(MakeBlock({0, 1}, {0, 0}, 5, 99)), 3);
    EXPECT_EQ(set.AddBlockSorted(MakeBlock({0, 1, 2, 3}, {0, 0, 0, 0}, 5, 1)), 0);
    ASSERT_EQ(set.BlockCount(), 5);
    const std::vector<int> scores = {1, 40, 30, 30, 99};
    for (int i = 0; i < 5; ++i)
        EXPECT_EQ(set.BlockAt(i)->Score(CSimBlock::kOriginal), scores[i]);
    EXPECT_EQ(set.BlockAt(3)->Identifier(), equalId);
    EXPECT_EQ(set.BlockAt(5), nullptr);
    EXPECT_EQ(set.BlockAt(-1), nullptr);
}

TEST(SimBlockSet, FindsAndRemovesBlocksByIdentifierAndPointer) {
    CSimBlockSet set;
    set.AddBlockSorted(MakeBlock({0, 1}, {0, 0}, 5, 30));
    set.AddBlockSorted(MakeBlock({0, 1}, {0, 0}, 5, 20));
    CSimBlock* second = set.BlockAt(1);
    EXPECT_EQ(set.FindBlock(second->Identifier()), second);
    EXPECT_EQ(set.FindBlock(-7), nullptr);
    const CSimBlock copy = *second;
    EXPECT_EQ(set.IndexOfBlock(copy), 1);
    set.RemoveBlock(&copy);  // a copy is not the block in the set
    EXPECT_EQ(set.BlockCount(), 2);
    set.RemoveBlock(second);
    EXPECT_EQ(set.BlockCount(), 1);
    EXPECT_EQ(set.IndexOfBlock(copy), -1);
}

TEST(SimBlockSet, MoleculeEntriesByKeyAndMemberIndexShift) {
    CSimBlockSet set;
    for (const char* key : {"A0", "B1", "C2", "D3", "E4"})
        set.AddMolecule({key, key, "mkv"});
    set.AddBlockSorted(MakeBlock({0, 1, 2, 3, 4}, {0, 0, 0, 0, 0}, 2, 9));
    set.AddBlockSorted(MakeBlock({0, 3}, {0, 0}, 2, 9));
    EXPECT_EQ(set.MoleculeUse("C2"), CSimBlockSet::kInBlocks);
    EXPECT_TRUE(set.BlockHasMolecule(*set.BlockAt(1), "D3"));
    EXPECT_FALSE(set.BlockHasMolecule(*set.BlockAt(1), "B1"));
    EXPECT_EQ(set.MoleculeUse("c2"), CSimBlockSet::kNotInSet);  // keys are case-sensitive

    set.RemoveBlock(set.BlockAt(0));
    EXPECT_EQ(set.MoleculeUse("C2"), CSimBlockSet::kInSetNoBlock);
    EXPECT_EQ(set.IndexOfMolecule("C2"), 2);
    set.RemoveMolecule("C2");
    EXPECT_EQ(set.FindMolecule("C2"), nullptr);
    EXPECT_EQ(set.MoleculeCount(), 4);

    set.AddBlockSorted(MakeBlock({0, 1, 2, 3, 4}, {0, 0, 0, 0, 0}, 2, 9));
    set.ShiftMemberIndices(2);
    const CSimBlock& block = *set.BlockAt(0);
    EXPECT_EQ(std::vector<std::int32_t>(block.Members().begin(), block.Members().end()),
              (std::vector<std::int32_t>{0, 1, 2, 2, 3}));
    EXPECT_EQ(set.MoleculeAt(3)->Key(), "E4");
    EXPECT_EQ(set.MoleculeAt(4), nullptr);
}

TEST(SimBlockSet, CopiesAreDeepAndKeepIdentifiersAndOrder) {
    CSimBlockSet set;
    set.SetSearchParameters(33, 5);
    set.AddMolecule({"K", "name", "mkv"});
    set.AddBlockSorted(MakeBlock({0, 1}, {1, 2}, 3, 7));
    set.AddBlockSorted(MakeBlock({0, 1, 2}, {1, 2, 3}, 3, 7));
    CSimBlockSet copy = set;
    copy.BlockAt(0)->SetName("changed");
    EXPECT_EQ(set.BlockAt(0)->Name(), "");
    EXPECT_EQ(copy.BlockAt(1)->Identifier(), set.BlockAt(1)->Identifier());
    EXPECT_EQ(copy.Cutoff(), 33);
    EXPECT_EQ(copy.MinSequences(), 5);
    EXPECT_EQ(*copy.MoleculeAt(0), *set.MoleculeAt(0));
    CSimBlockSet assigned;
    assigned.AddBlockSorted(MakeBlock({4, 5}, {0, 0}, 2, 1));
    assigned = set;
    ASSERT_EQ(assigned.BlockCount(), 2);
    EXPECT_TRUE(*assigned.BlockAt(1) == *set.BlockAt(1));
    CSimBlockSet never;
    EXPECT_EQ(never.Cutoff(), -1);
    EXPECT_EQ(never.MinSequences(), -1);
}

// The block record as written member by member, independently of CSimBlock::Serialize.
TEST(SimBlockStorage, MembersAreStoredInTheirFixedOrder) {
    CArchive ar = CArchive::ForWriting();
    std::int32_t identifier = 7;
    std::string name = "ud1";
    std::uint32_t colour = 0x00FF00;
    std::int16_t reserved[2] = {3, 4};
    std::int32_t width[2] = {10, 9};
    std::int32_t score[2] = {55, 40};
    std::int32_t flag = 1;
    CIntSerialArray members{2, 5};
    CIntSerialArray original{11, 12};
    CIntSerialArray current{13, 14};
    CBoolSerialArray included{1, 0};
    ar.XMember(identifier);
    ar.XMember(name);
    ar.XMember(colour);
    for (int layout = 0; layout < 2; ++layout) {
        ar.XMember(reserved[layout]);
        ar.XMember(width[layout]);
        ar.XMember(score[layout]);
    }
    ar.XMember(flag);
    ar.XData(members);
    ar.XData(original);
    ar.XData(current);
    ar.XData(included);

    CSimBlock block;
    Load(ar.Bytes(), block);
    EXPECT_EQ(block.Identifier(), 7);
    EXPECT_EQ(block.Name(), "ud1");
    EXPECT_EQ(block.Colour(), 0x00FF00u);
    EXPECT_EQ(block.Reserved(CSimBlock::kOriginal), 3);
    EXPECT_EQ(block.Reserved(CSimBlock::kCurrent), 4);
    EXPECT_EQ(block.Width(CSimBlock::kOriginal), 10);
    EXPECT_EQ(block.Width(CSimBlock::kCurrent), 9);
    EXPECT_EQ(block.Score(CSimBlock::kOriginal), 55);
    EXPECT_EQ(block.Score(CSimBlock::kCurrent), 40);
    EXPECT_EQ(block.Flag(), 1);
    EXPECT_EQ(block.Member(1), 5);
    EXPECT_EQ(block.Start(CSimBlock::kOriginal, 0), 11);
    EXPECT_EQ(block.Start(CSimBlock::kCurrent, 1), 14);
    EXPECT_FALSE(block.IsIncluded(1));
    EXPECT_EQ(Store(block), ar.Bytes());
}

TEST(SimBlockStorage, BlockSetRoundTripsAndOlderRecordsHaveNoEntries) {
    CSimBlockSet set;
    set.SetSearchParameters(30, 4);
    set.AddMolecule({"K1", "one", "mkvl"});
    set.AddMolecule({"K2", "two", "mkil"});
    set.AddBlockSorted(MakeBlock({0, 1}, {0, 1}, 3, 12));
    set.BlockAt(0)->SetIncluded(1, false);
    CSimBlockSet loaded;
    Load(Store(set), loaded);
    ASSERT_EQ(loaded.BlockCount(), 1);
    EXPECT_TRUE(*loaded.BlockAt(0) == *set.BlockAt(0));
    EXPECT_EQ(loaded.Cutoff(), 30);
    EXPECT_EQ(loaded.MinSequences(), 4);
    ASSERT_EQ(loaded.MoleculeCount(), 2);
    EXPECT_EQ(*loaded.MoleculeAt(1), *set.MoleculeAt(1));

    // A record that ends after its block list.
    CArchive ar = CArchive::ForWriting();
    std::int32_t cutoff = 30, minimum = 4;
    ar.XMember(cutoff);
    ar.XMember(minimum);
    CSimBlockSerialList blocks;
    blocks.items.push_back(MakeBlock({0, 1}, {0, 1}, 3, 12));
    ar.XData(blocks);
    CSimBlockSet older;
    older.AddMolecule({"stale", "stale", "m"});
    Load(ar.Bytes(), older);
    EXPECT_EQ(older.BlockCount(), 1);
    EXPECT_EQ(older.MoleculeCount(), 0);
}

TEST(SimBlockStorage, NewIdentifiersStayAboveLoadedOnes) {
    CSimBlock stored;
    CArchive ar = CArchive::ForWriting();
    std::int32_t identifier = 1'000'000;
    ar.XMember(identifier);
    std::vector<std::uint8_t> bytes = Store(stored);
    // Replace the stored identifier (the first member: type code, then 4 bytes).
    std::copy(ar.Bytes().begin(), ar.Bytes().end(), bytes.begin());
    CSimBlock loaded;
    Load(bytes, loaded);
    EXPECT_EQ(loaded.Identifier(), 1'000'000);
    CSimBlock fresh;
    EXPECT_GT(fresh.Identifier(), 1'000'000);
}

TEST(SimBlockStorage, InconsistentOrEmptyElementsAreFormatErrors) {
    auto block = MakeBlock({0, 1}, {0, 1}, 3, 12);
    CSimBlock shorter = *block;
    shorter.Init(std::vector<std::int32_t>{0}, std::vector<std::int32_t>{0}, 3, 12, 0);
    // Splice the one-element current starts of `shorter` into the record of `block`.
    CArchive ar = CArchive::ForWriting();
    std::int32_t id = 1, flag = 0;
    std::string name;
    std::uint32_t colour = 0;
    std::int16_t reserved = 0;
    std::int32_t value = 3;
    ar.XMember(id);
    ar.XMember(name);
    ar.XMember(colour);
    for (int layout = 0; layout < 2; ++layout) {
        ar.XMember(reserved);
        ar.XMember(value);
        ar.XMember(value);
    }
    ar.XMember(flag);
    CIntSerialArray two{0, 1};
    CIntSerialArray one{0};
    CBoolSerialArray included{1, 1};
    ar.XData(two);
    ar.XData(two);
    ar.XData(one);
    ar.XData(included);
    CSimBlock loaded;
    EXPECT_THROW(Load(ar.Bytes(), loaded), CArchiveException);

    CArchive list = CArchive::ForWriting();
    CSimBlockSerialList withNull;
    withNull.items.push_back(nullptr);
    withNull.Serialize(list);
    CSimBlockSerialList read;
    EXPECT_THROW(Load(list.Bytes(), read), CArchiveException);
    EXPECT_TRUE(read.items.empty());
}

TEST(SimBlock, LayoutScoreSumsPairsOverColumnsOfEncodableMolecules) {
    const CScoreMatrix blosum("blosum62mt");
    // W-W 11, W-Y 2, A-A 4, A-C 0, C-C 9, Y-Y 7.
    const std::vector<CSxMolEntry> molecules = {
        {"1", "one", "wwa"}, {"2", "bad", "w1a"}, {"3", "two", "WWC"}, {"4", "three", "xwya"}};
    // Members index the encodable molecules: 0 = wwa, 1 = WWC, 2 = xwya.
    auto block = MakeBlock({0, 1, 2}, {0, 0, 1}, 3, 0);
    // Columns: (w,W,w) (w,W,y) (a,C,a): 3*11 + (11+2+2) + (0+4+0).
    EXPECT_EQ(block->LayoutScore(CSimBlock::kOriginal, molecules, blosum, 0), 33 + 15 + 4);
    block->SetIncluded(1, false);
    // Only members 0 and 2: w-w, w-y, a-a.
    EXPECT_EQ(block->LayoutScore(CSimBlock::kCurrent, molecules, blosum, 0), 11 + 2 + 4);
    // Shifted by one: (w,y), (a,a), then past the end of member 0 (adds nothing).
    EXPECT_EQ(block->LayoutScore(CSimBlock::kCurrent, molecules, blosum, 1), 2 + 4);

    CSxMolEntrySerialList list;
    for (const auto& entry : molecules)
        list.items.push_back(std::make_unique<CSxMolEntry>(entry));
    EXPECT_EQ(block->LayoutScore(CSimBlock::kCurrent, list, blosum, 0), 17);
    // A member index beyond the encodable molecules adds nothing.
    auto beyond = MakeBlock({0, 7}, {0, 0}, 2, 0);
    EXPECT_EQ(beyond->LayoutScore(CSimBlock::kOriginal, molecules, blosum, 0), 0);
}

TEST(SimSegment, ContainsItsPositionsOnly) {
    const CSimSegment segment(4, 10, 3);
    EXPECT_FALSE(segment.Contains(9));
    EXPECT_TRUE(segment.Contains(10));
    EXPECT_TRUE(segment.Contains(12));
    EXPECT_FALSE(segment.Contains(13));
    EXPECT_EQ(segment.Range(), std::make_pair(10, 12));
    const CSimSegment negative(4, -2, 5);
    EXPECT_FALSE(negative.Contains(-1));
    EXPECT_TRUE(negative.Contains(0));
}

}  // namespace

namespace {

// Adding many blocks at once gives the order that adding them one by one gives, whether the
// set was in block order before or not.
TEST(SimBlockSet, AddingManyBlocksKeepsTheOrderOfSingleInsertions) {
    std::mt19937 random(3);
    std::uniform_int_distribution<int> members(2, 5);
    std::uniform_int_distribution<int> score(0, 6);
    auto randomBlock = [&] {
        std::vector<std::int32_t> molecules(members(random));
        for (std::size_t i = 0; i < molecules.size(); ++i)
            molecules[i] = static_cast<int>(i);
        return MakeBlock(molecules, molecules, 3, score(random));
    };
    for (bool unordered : {false, true}) {
        CSimBlockSet one;
        CSimBlockSet many;
        for (int i = 0; i < 20; ++i) {
            auto block = randomBlock();
            one.AddBlockSorted(std::make_unique<CSimBlock>(*block));
            many.AddBlockSorted(std::move(block));
        }
        if (unordered) {  // as a file may hold them
            CSimBlockSerialList reversed;
            for (int i = one.BlockCount() - 1; i >= 0; --i) {
                reversed.items.push_back(std::make_unique<CSimBlock>(*one.BlockAt(i)));
            }
            CSimBlockSet fromFile;
            CArchive ar = CArchive::ForWriting();
            std::int32_t cutoff = 1, minimum = 2;
            ar.XMember(cutoff);
            ar.XMember(minimum);
            ar.XData(reversed);
            Load(ar.Bytes(), one);
            Load(ar.Bytes(), many);
        }
        std::vector<std::unique_ptr<CSimBlock>> added;
        for (int i = 0; i < 200; ++i) {
            added.push_back(randomBlock());
            one.AddBlockSorted(std::make_unique<CSimBlock>(*added.back()));
        }
        many.AddBlocksSorted(std::move(added));
        ASSERT_EQ(many.BlockCount(), one.BlockCount());
        for (int i = 0; i < one.BlockCount(); ++i) {
            EXPECT_EQ(many.BlockAt(i)->Identifier(), one.BlockAt(i)->Identifier()) << i;
        }
    }
}

}  // namespace
