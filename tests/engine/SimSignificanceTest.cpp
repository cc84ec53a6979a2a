// Block significance from the statistics table of the matrix.

#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "BlockSignificance.h"
#include "ScoreMatrix.h"
#include "SimBlockSet.h"
#include "engine/reference/LiteralSearch.h"

namespace {

CSimBlockSet SetWithLengths(const std::vector<int>& lengths) {
    CSimBlockSet set;
    for (std::size_t i = 0; i < lengths.size(); ++i) {
        set.AddMolecule({std::to_string(i), "m", std::string(lengths[i], 'a')});
    }
    return set;
}

CSimBlock BlockOf(int members, int score) {
    std::vector<std::int32_t> indices(members);
    for (int i = 0; i < members; ++i)
        indices[i] = i;
    CSimBlock block;
    block.Init(indices, std::vector<std::int32_t>(members, 0), 5, score, 0);
    return block;
}

TEST(SimSignificance, BuiltInMatricesLeaveEveryBlockUnevaluated) {
    const CSimBlockSet set = SetWithLengths({100, 200, 300});
    for (const char* name : {"blosum62mt", "pam120mt", "gon250mt"}) {
        const CScoreMatrix matrix(name);
        for (int score : {0, 50, 100000}) {
            const CBlockSignificance result = EvaluateBlockSignificance(
                BlockOf(2, score), &set, matrix, 0.0001, CSimBlock::kOriginal);
            EXPECT_EQ(result.state, kNotEvaluated);
            EXPECT_EQ(result.p, 1.0);
        }
    }
}

TEST(SimSignificance, ProbabilityFromTheSearchSpaceAndTheLimitDecides) {
    const CSimBlockSet set = SetWithLengths({100, 200, 300});
    CScoreMatrix matrix("blosum62mt");
    matrix.Statistics().Set(2, 0.3, 0.1, false);
    const CSimBlock block = BlockOf(2, 40);
    // Search space 100*200 + 100*300 + 200*300 = 110000.
    const double expected = 1.0 - std::exp(-0.1 * 110000 * std::exp(-0.3 * 40));
    const CBlockSignificance strict =
        EvaluateBlockSignificance(block, &set, matrix, expected * 1.01, CSimBlock::kOriginal);
    EXPECT_EQ(strict.state, kSignificant);
    EXPECT_NEAR(strict.p, expected, expected * 1e-12);
    const CBlockSignificance lowered =
        EvaluateBlockSignificance(block, &set, matrix, expected * 0.99, CSimBlock::kOriginal);
    EXPECT_EQ(lowered.state, kNotSignificant);
    EXPECT_EQ(lowered.p, strict.p);

    // No constants for three sequences: a three-member block is not evaluated.
    EXPECT_EQ(
        EvaluateBlockSignificance(BlockOf(3, 40), &set, matrix, 1.0, CSimBlock::kOriginal).state,
        kNotEvaluated);
    EXPECT_EQ(EvaluateBlockSignificance(block, nullptr, matrix, 1.0, CSimBlock::kOriginal).state,
              kNotEvaluated);
}

TEST(SimSignificance, LayoutDecidesSequenceCountAndScore) {
    const CSimBlockSet set = SetWithLengths({50, 60, 70});
    CScoreMatrix matrix("blosum62mt");
    matrix.Statistics().Set(2, 0.25, 0.05, true);
    matrix.Statistics().Set(3, 0.2, 0.04, false);
    CSimBlock block = BlockOf(3, 80);
    block.SetIncluded(2, false);
    block.SetCurrentScore(30);
    const CBlockSignificance current =
        EvaluateBlockSignificance(block, &set, matrix, 1.0, CSimBlock::kCurrent);
    const double space2 = 50.0 * 60 + 50 * 70 + 60 * 70;
    EXPECT_NEAR(current.p, 1 - std::exp(-0.05 * space2 * std::exp(-0.25 * 30)), 1e-15);
    const CBlockSignificance original =
        EvaluateBlockSignificance(block, &set, matrix, 1.0, CSimBlock::kOriginal);
    EXPECT_NEAR(original.p, 1 - std::exp(-0.04 * 50.0 * 60 * 70 * std::exp(-0.2 * 80)), 1e-15);

    block.SetIncluded(1, false);
    const CBlockSignificance single =
        EvaluateBlockSignificance(block, &set, matrix, 1.0, CSimBlock::kCurrent);
    EXPECT_EQ(single.state, kNotEvaluated);
    EXPECT_EQ(single.p, 1.0);
}

TEST(SimSignificance, BlocksOfMoreThanSixteenSequencesUseTheConstantsOfSixteen) {
    const CSimBlockSet set = SetWithLengths(std::vector<int>(20, 10));
    CScoreMatrix matrix("blosum62mt");
    matrix.Statistics().Set(16, 0.01, 0.5, false);
    matrix.Statistics().Set(20, 9.0, 9.0, false);
    const double space = 1e20;  // 20 lengths of 10, all chosen
    const CBlockSignificance result =
        EvaluateBlockSignificance(BlockOf(20, 5000), &set, matrix, 1.0, CSimBlock::kOriginal);
    EXPECT_NEAR(result.p, 1 - std::exp(-0.5 * space * std::exp(-0.01 * 5000)), 1e-12);
}

TEST(SimSignificance, UndefinedAndTinyProbabilities) {
    const CSimBlockSet set = SetWithLengths({100, 100});
    CScoreMatrix matrix("blosum62mt");
    matrix.Statistics().Set(2, std::nan(""), 0.1, false);
    const CBlockSignificance undefined =
        EvaluateBlockSignificance(BlockOf(2, 10), &set, matrix, 0.5, CSimBlock::kOriginal);
    EXPECT_EQ(undefined.state, kNotSignificant);
    EXPECT_TRUE(std::isnan(undefined.p));

    // 0.1 * 10000 * exp(-50) is about 2e-19: reported as such, not rounded to 0.
    matrix.Statistics().Set(2, 1.0, 0.1, false);
    const CBlockSignificance tiny =
        EvaluateBlockSignificance(BlockOf(2, 50), &set, matrix, 1e-10, CSimBlock::kOriginal);
    EXPECT_EQ(tiny.state, kSignificant);
    EXPECT_NEAR(tiny.p, 1000 * std::exp(-50.0), 1e-30);
}

TEST(SimSignificance, RecurrenceMatchesTheSumOverEveryChoiceOfLengths) {
    const std::vector<double> three = {100, 200, 300};
    EXPECT_EQ(ElementarySymmetricSum(three, 2), 110000.0);
    EXPECT_EQ(ElementarySymmetricSum(three, 0), 1.0);
    EXPECT_EQ(ElementarySymmetricSum(three, 4), 0.0);
    std::mt19937 random(8);
    std::uniform_real_distribution<double> length(0, 1500);
    for (int round = 0; round < 60; ++round) {
        std::vector<double> lengths(1 + round % 14);
        for (double& value : lengths)
            value = std::floor(length(random));
        for (int n = 1; n <= static_cast<int>(lengths.size()); ++n) {
            const double expected = literal::SearchSpace(lengths, n);
            EXPECT_NEAR(ElementarySymmetricSum(lengths, n), expected, expected * 1e-12);
        }
    }
}

}  // namespace
