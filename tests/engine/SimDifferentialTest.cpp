// The fast engine against the literal search on many random inputs: same hits, same diagonals
// in the same order, same blocks in the same order with the same scores.

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "SimTool.h"
#include "engine/reference/LiteralSearch.h"
#include "engine/reference/RandomInputs.h"
#include "search/PairScan.h"

namespace {

using literal::CSearchInput;

// The blocks with the order they were made in: the rank of their identifier, since a search
// hands identifiers out in that order, however many threads make the blocks.
std::vector<literal::CBlock> BlocksOf(const CSimBlockSet& set) {
    std::vector<int> identifiers;
    for (int i = 0; i < set.BlockCount(); ++i)
        identifiers.push_back(set.BlockAt(i)->Identifier());
    std::sort(identifiers.begin(), identifiers.end());
    std::vector<literal::CBlock> blocks;
    for (int i = 0; i < set.BlockCount(); ++i) {
        const CSimBlock& block = *set.BlockAt(i);
        const auto rank =
            std::lower_bound(identifiers.begin(), identifiers.end(), block.Identifier());
        blocks.push_back(
            {std::vector<int>(block.Members().begin(), block.Members().end()),
             std::vector<int>(block.OriginalStarts().begin(), block.OriginalStarts().end()),
             block.Width(CSimBlock::kOriginal), block.Score(CSimBlock::kOriginal),
             static_cast<int>(rank - identifiers.begin())});
    }
    return blocks;
}

// The literal expansion and block insertion grow with the square of what they find; inputs
// whose result is larger than this are left out (and counted).
constexpr std::size_t kLiteralDiagonalLimit = 2000;

struct CTally {
    int compared = 0;
    int skipped = 0;
    std::size_t blocks = 0;
};

// Runs the engine, then the literal search, and compares every intermediate result.
void ExpectSameSearch(const CSearchInput& input, int threads, CTally& tally) {
    std::vector<CSxMolEntry> molecules;
    for (std::size_t i = 0; i < input.sequences.size(); ++i) {
        molecules.emplace_back("K" + std::to_string(i), "m" + std::to_string(i),
                               input.sequences[i]);
    }
    CSimBlockSet result;
    CSimTool tool(literal::MatrixOf(input), CSimBlockParameters(input.cutoff, input.minSequences),
                  molecules, &result);
    tool.SetThreadCount(threads);
    tool.SetMemoryBudget(SIZE_MAX);  // results here may be large; the budget is not under test
    ASSERT_EQ(tool.Run(), 1) << literal::Describe(input);
    if (tool.Diagonals().size() > kLiteralDiagonalLimit) {
        ++tally.skipped;
        return;
    }
    const literal::CResult expected =
        literal::Search(input.table, input.cutoff, input.minSequences, literal::CodesOf(input));
    ++tally.compared;
    tally.blocks += expected.blocks.size();
    EXPECT_EQ(tool.Hits(), expected.hits) << literal::Describe(input);
    EXPECT_EQ(tool.Diagonals(), expected.diagonals) << literal::Describe(input);
    EXPECT_EQ(BlocksOf(result), expected.blocks) << literal::Describe(input);
}

template <class MakeInput>
CTally CompareRounds(unsigned seed, int rounds, MakeInput makeInput) {
    std::mt19937 random(seed);
    CTally tally;
    for (int round = 0; round < rounds && !::testing::Test::HasFailure(); ++round) {
        ExpectSameSearch(makeInput(random), 1 + round % 3, tally);
    }
    EXPECT_LE(tally.skipped * 10, rounds);
    return tally;
}

TEST(SimDifferential, UnrelatedSequencesIncludingEmptyAndShortOnes) {
    const CTally tally = CompareRounds(
        11, 300, [](std::mt19937& random) { return literal::RandomUnrelated(random, 7, 40); });
    EXPECT_GT(tally.blocks, 0u);  // the inputs reach phase three
}

TEST(SimDifferential, FamiliesWithShiftedStretches) {
    const CTally tally = CompareRounds(23, 200, [](std::mt19937& random) {
        return literal::RandomFamily(random, 6, 50, 25, true);
    });
    EXPECT_GT(tally.blocks, 200u);
}

// Up to twelve near-identical sequences: the depth-first expansion visits every subset of the
// family, the fast one must keep the same diagonals.
TEST(SimDifferential, FamiliesOfNearIdenticalSequences) {
    const CTally tally = CompareRounds(29, 100, [](std::mt19937& random) {
        return literal::RandomFamily(random, 12, 40, 8, false);
    });
    EXPECT_GT(tally.blocks, 100u);
}

TEST(SimDifferential, RepeatsThatHitOnSeveralDiagonals) {
    CompareRounds(37, 200, [](std::mt19937& random) { return literal::RandomRepeats(random, 5); });
}

// Phase one alone on longer sequences, with the vector kernel, its lane boundaries, and score
// ranges that need the scalar fallback.
TEST(SimDifferential, PairScanMatchesLiteralComparison) {
    std::mt19937 random(5);
    const std::string letters = "ABCDEFGHIKLMNPQRSTVWXYZ";
    struct CRange {
        int low, high, cutoffLow, cutoffHigh;
    };
    const CRange ranges[] = {{-4, 11, 1, 60},
                             {-4, 11, -5, 3},
                             {-7000, 7000, 7000, 8000},
                             {-9000, 9000, 9000, 30000},
                             {-2, 2, 1, 6}};
    for (int round = 0; round < 200; ++round) {
        const CRange range = ranges[round % 5];
        const int size = std::uniform_int_distribution<int>(1, 23)(random);
        literal::CTable table = literal::RandomTable(random, size, range.low, range.high);
        const int cutoff =
            std::uniform_int_distribution<int>(range.cutoffLow, range.cutoffHigh)(random);
        std::uniform_int_distribution<int> length(0, round % 4 == 0 ? 3 : 300);
        std::vector<std::vector<std::uint8_t>> codes(2);
        for (auto& sequence : codes) {
            const int count = round % 7 == 0 ? 64 * (1 + round % 3) + (round % 2) : length(random);
            for (int i = 0; i < count; ++i) {
                sequence.push_back(std::uniform_int_distribution<int>(1, size)(random));
            }
        }
        const CScoreGrid grid(size, table.scores);
        std::vector<const std::vector<std::uint8_t>*> pointers{&codes[0], &codes[1]};
        const CPairScanner scanner(grid, cutoff, pointers);
        std::vector<std::int32_t> offsets;
        scanner.Scan(0, 1, offsets);
        const std::vector<int> expected = literal::ComparePair(table, cutoff, codes[0], codes[1]);
        ASSERT_EQ(std::vector<int>(offsets.begin(), offsets.end()), expected)
            << "round " << round << " cutoff " << cutoff << " vectorised "
            << scanner.IsVectorised();
    }
}

}  // namespace
