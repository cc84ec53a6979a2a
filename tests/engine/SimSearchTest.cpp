// The search driver and the phases on hand-made inputs: hits, diagonals, blocks, progress,
// cancellation and the ways a search ends early.

#include <gtest/gtest.h>

#include <cstdarg>

#include "ScoreMatrix.h"
#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "SimTool.h"
#include "engine/SearchEntries.h"
#include "search/DiagonalScan.h"
#include "search/MemoryStatus.h"

namespace {

// Records what the engine reports; can cancel at a given step and pretend memory is low.
class CRecordingTool : public CSimTool {
  public:
    using CSimTool::CSimTool;

    std::vector<std::string> events;
    std::vector<std::string> messages;
    int cancelAtStep = -1;
    bool memoryLow = false;
    int steps = 0;

  protected:
    void BeginPhase(const std::string& text, int lower, int upper, int step) override {
        events.push_back("begin " + text + " " + std::to_string(lower) + ".." +
                         std::to_string(upper) + "/" + std::to_string(step));
    }
    bool StepProgress() override { return ++steps == cancelAtStep; }
    int Finish(int ok) override {
        events.push_back("finish " + std::to_string(ok));
        return ok;
    }
    void ReportProgress(const char* format, ...) override {
        va_list args;
        va_start(args, format);
        events.push_back("progress " + FormatText(format, args));
        va_end(args);
    }
    void SetStatusText(const std::string& text) override { events.push_back("status " + text); }
    void ShowMessage(const std::string& message) override { messages.push_back(message); }
    bool IsMemoryLow() override { return memoryLow; }
};

struct CSearch {
    CScoreMatrix matrix{"blosum62mt"};
    CSimBlockSet result;
    std::unique_ptr<CRecordingTool> tool;

    CSearch(const std::vector<std::string>& sequences, int cutoff, int minSequences) {
        tool = std::make_unique<CRecordingTool>(matrix, CSimBlockParameters(cutoff, minSequences),
                                                Entries(sequences), &result);
    }
};

TEST(SimSearch, ThreeTryptophansHitOnlyOnTheirOwnDiagonalAndOnlyAtTheCutoff) {
    CSearch atCutoff({"WWW", "www"}, 33, 2);
    ASSERT_EQ(atCutoff.tool->Run(), 1);
    EXPECT_EQ(atCutoff.tool->Hits(), (std::vector<CSimHit>{{0, 1, 0}}));

    CSearch above({"WWW", "WWW"}, 34, 2);
    ASSERT_EQ(above.tool->Run(), 1);
    EXPECT_TRUE(above.tool->Hits().empty());
}

TEST(SimSearch, RunningScoreRestartsAtZeroAfterALossyStretch) {
    // On offset 0 the sums go 11, 22, 18, ... down to 0 and then 11, 22, 33; without the
    // restart they would end at 27.
    CSearch search({"WWPPPPPPPWWW", "WWWWWWWWWWWW"}, 33, 2);
    ASSERT_EQ(search.tool->Run(), 1);
    const auto& hits = search.tool->Hits();
    EXPECT_NE(std::find(hits.begin(), hits.end(), CSimHit{0, 1, 0}), hits.end());
}

TEST(SimSearch, DiagonalsNeedTheMinimumOfConsistentMolecules) {
    for (int minimum : {2, 3}) {
        CSearch pairOnly({"WWW", "WWW", "PPP"}, 33, minimum);
        ASSERT_EQ(pairOnly.tool->Run(), 1);
        EXPECT_EQ(pairOnly.tool->Hits(), (std::vector<CSimHit>{{0, 1, 0}}));
        EXPECT_EQ(pairOnly.tool->Diagonals().size(), minimum == 2 ? 1u : 0u);
    }

    // Hits (0,1,1), (0,2,2) and (1,2,1) agree: one diagonal, from the hit of its two lowest
    // members, and one block over the three tryptophans.
    CSearch three({"WWWK", "KWWW", "KKWWW"}, 33, 3);
    ASSERT_EQ(three.tool->Run(), 1);
    EXPECT_EQ(three.tool->Hits(), (std::vector<CSimHit>{{0, 1, 1}, {0, 2, 2}, {1, 2, 1}}));
    CSimDiag expected;
    expected.members = {0, 1, 2};
    expected.offsets = {0, 1, 2};
    EXPECT_EQ(three.tool->Diagonals(), std::vector<CSimDiag>{expected});
    ASSERT_EQ(three.result.BlockCount(), 1);
    const CSimBlock& block = *three.result.BlockAt(0);
    EXPECT_EQ(block.OriginalStarts(), (CIntSerialArray{0, 1, 2}));
    EXPECT_EQ(block.Width(CSimBlock::kOriginal), 3);
    EXPECT_EQ(block.Score(CSimBlock::kOriginal), 3 * 3 * 11);
    EXPECT_EQ(block.Flag(), 0);
    EXPECT_TRUE(block.IsUnedited());
}

// Codes: 1 A, 2 B, 3 C, 4 D, 5 X. A-A, B-B, B-D and C-D score 1, X-X -1, all else -5.
CScoreGrid ColumnExampleGrid() {
    std::vector<int> scores(25, -5);
    auto set = [&](int a, int b, int value) {
        scores[(a - 1) * 5 + (b - 1)] = value;
        scores[(b - 1) * 5 + (a - 1)] = value;
    };
    set(1, 1, 1);
    set(2, 2, 1);
    set(2, 4, 1);
    set(3, 4, 1);
    set(5, 5, -1);
    return CScoreGrid(5, scores);
}

std::vector<std::uint8_t> Codes(const std::string& text) {
    std::vector<std::uint8_t> codes;
    for (char c : text)
        codes.push_back(c == 'X' ? 5 : static_cast<std::uint8_t>(c - 'A' + 1));
    return codes;
}

TEST(SimDiagonalScan, ThreeMembersJoinedOverOneStretchMakeOneBlock) {
    // Members 0 and 1 are joined over positions 10..13; 0-2 and 1-2 over 11..20.
    const std::string filler(10, 'X');
    const auto first = Codes(filler + "ABBBBBBBBBB" + std::string(9, 'X'));
    const auto second = Codes(filler + "ABBBCCCCCCC" + std::string(9, 'X'));
    const auto third = Codes(filler + "XDDDDDDDDDD" + std::string(9, 'X'));
    const std::vector<const std::vector<std::uint8_t>*> sequences{&first, &second, &third};
    CSimDiag diagonal;
    diagonal.members = {0, 1, 2};
    diagonal.offsets = {0, 0, 0};
    const CScoreGrid grid = ColumnExampleGrid();
    // Every pair placed at offset 0.
    std::vector<std::vector<std::vector<std::int32_t>>> offsets(
        3, std::vector<std::vector<std::int32_t>>(3, std::vector<std::int32_t>{0}));
    const std::function<bool()> goOn = [] { return false; };
    for (int minimum : {2, 3}) {
        CPlacementJoins joins(sequences, grid, 4, offsets);
        std::vector<CBlockCandidate> blocks;
        ASSERT_TRUE(ScanDiagonal(diagonal, 30, minimum, joins, goOn, blocks));
        ASSERT_EQ(blocks.size(), 1u) << minimum;
        EXPECT_EQ(blocks[0].molecules, (std::vector<std::int32_t>{0, 1, 2}));
        EXPECT_EQ(blocks[0].starts, (std::vector<std::int32_t>{11, 11, 11}));
        EXPECT_EQ(blocks[0].width, 10);
        EXPECT_EQ(blocks[0].score, 3 * 3 + 7 * (-5 + 1 + 1));
    }

    // Without the third member only the pair is joined: a block of two, or none with S = 3.
    const auto unrelated = Codes(std::string(30, 'X'));
    const std::vector<const std::vector<std::uint8_t>*> pairOnly{&first, &second, &unrelated};
    CPlacementJoins joins(pairOnly, grid, 4, offsets);
    std::vector<CBlockCandidate> blocks;
    ASSERT_TRUE(ScanDiagonal(diagonal, 30, 3, joins, goOn, blocks));
    EXPECT_TRUE(blocks.empty());
    ASSERT_TRUE(ScanDiagonal(diagonal, 30, 2, joins, goOn, blocks));
    ASSERT_EQ(blocks.size(), 1u);
    EXPECT_EQ(blocks[0].molecules, (std::vector<std::int32_t>{0, 1}));
    EXPECT_EQ(blocks[0].starts, (std::vector<std::int32_t>{10, 10}));
    EXPECT_EQ(blocks[0].width, 4);
}

TEST(SimDiagonalScan, JoinedRunsAreTheBestPrefixesOfTheirStretches) {
    const CScoreGrid grid = ColumnExampleGrid();
    // Sums 1 2 3, then -2 ends the first stretch; the second climbs to 3 and drifts down to 1
    // at the end of the overlap, keeping only its best prefix.
    const auto a = Codes("AAAAAAAXX");
    const auto b = Codes("AAAXAAAXX");
    std::vector<CJoinedRun> runs;
    FindJoinedRuns(a.data(), b.data(), 9, grid, 3, runs);
    ASSERT_EQ(runs.size(), 2u);
    EXPECT_EQ(runs[0].begin, 0);
    EXPECT_EQ(runs[0].end, 3);
    EXPECT_EQ(runs[1].begin, 4);
    EXPECT_EQ(runs[1].end, 7);
    FindJoinedRuns(a.data(), b.data(), 9, grid, 4, runs);
    EXPECT_TRUE(runs.empty());
}

TEST(SimTool, ReportsEveryPhaseWithItsRealRangeAndRecordsTheParameters) {
    CSearch search({"MKV", "PPG"}, 33, 5);
    EXPECT_EQ(search.tool->Run(), 1);
    const std::vector<std::string> expected = {
        "status Initializing...",
        "begin Performing pairwise comparisons... 0..1/1",
        "progress Performing pairwise comparisons (1 of 1)",
        "begin Expanding diagonals... 0..0/1",
        "begin Scanning each diagonal for blocks... 0..0/1",
        "finish 1",
    };
    EXPECT_EQ(search.tool->events, expected);
    EXPECT_EQ(search.result.BlockCount(), 0);
    EXPECT_EQ(search.result.Cutoff(), 33);
    EXPECT_EQ(search.result.MinSequences(), 5);
    ASSERT_EQ(search.result.MoleculeCount(), 2);
    EXPECT_EQ(search.result.MoleculeAt(1)->Key(), "K1");
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kNoFailure);
}

TEST(SimTool, ConstructionReplacesTheResultSetsBlocksAndEntries) {
    CScoreMatrix matrix("blosum62mt");
    CSimBlockSet result;
    result.AddMolecule({"old", "old", "mkv"});
    result.AddBlockSorted(std::make_unique<CSimBlock>());
    CSimTool tool(matrix, CSimBlockParameters(33, 2), Entries({"MKV", "MKV", "GGG"}), &result);
    EXPECT_EQ(result.BlockCount(), 0);
    ASSERT_EQ(result.MoleculeCount(), 3);
    EXPECT_EQ(result.MoleculeAt(2)->Sequence(), "GGG");
}

TEST(SimTool, CancelEndsAfterTheCurrentPairAndRunsNothingElse) {
    const std::string shared = "MKVLWWWCAGHY";
    for (int threads : {1, 2}) {
        CSearch search({shared, shared, shared, shared}, 33, 2);
        search.tool->SetThreadCount(threads);
        search.tool->cancelAtStep = 2;
        EXPECT_EQ(search.tool->Run(), 0);
        // Only pairs (0,1) and (0,2) were merged.
        for (const CSimHit& hit : search.tool->Hits()) {
            EXPECT_TRUE(hit.first == 0 && (hit.second == 1 || hit.second == 2));
        }
        EXPECT_FALSE(search.tool->Hits().empty());
        EXPECT_TRUE(search.tool->Diagonals().empty());
        EXPECT_EQ(search.tool->events.back(), "finish 0");
        EXPECT_EQ(search.tool->events.end()[-2],
                  "progress Performing pairwise comparisons (2 of 6)");
        EXPECT_EQ(search.tool->LastFailure(), CSimTool::kCancelled);
        EXPECT_EQ(search.result.Cutoff(), 33);
    }
}

TEST(SimTool, ASequenceOutsideTheAlphabetEndsTheRunSilently) {
    CSearch search({"MKVL", "MK1V", "MKVL"}, 33, 2);
    EXPECT_EQ(search.tool->Run(), 0);
    EXPECT_EQ(search.tool->events,
              (std::vector<std::string>{"status Initializing...", "finish 0"}));
    EXPECT_TRUE(search.tool->messages.empty());
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kUnencodableSequence);
    EXPECT_EQ(search.tool->FailedMolecule(), 1);
    EXPECT_EQ(search.result.Cutoff(), -1);
}

TEST(SimTool, FewerThanTwoMoleculesEndBeforeAnyPhase) {
    CSearch search({"MKVL"}, 33, 2);
    EXPECT_EQ(search.tool->Run(), 0);
    EXPECT_EQ(search.tool->events,
              (std::vector<std::string>{"status Initializing...", "finish 0"}));
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kTooFewMolecules);
}

TEST(SimTool, LowMemoryDuringExpansionShowsTheMessageOnceAndFails) {
    CSearch search({"WWWK", "KWWW", "KKWWW"}, 33, 2);
    search.tool->memoryLow = true;
    EXPECT_EQ(search.tool->Run(), 0);
    EXPECT_EQ(search.tool->messages,
              std::vector<std::string>{"Your system is getting low of virtual memory.\n"
                                       "Unable to proceed with block searching."});
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kLowMemory);
    EXPECT_TRUE(search.tool->Diagonals().empty());
}

// A sequence whose two ends match each other (offset 14, and no other offset but 0 reaches the
// cutoff 40) lets every copy sit on either of two diagonals: the copies at offsets drawn from
// {0, 14}, or from {-14, 0}, relative to the first
// are all maximal diagonals, 2^n - 1 of them for n copies. The count is what the search defines,
// so no expansion can avoid it; the budget below is what stops large families of this kind.
TEST(SimTool, CopiesOfASelfSimilarSequenceDoubleTheDiagonalsWithEachCopy) {
    const std::string sequence = "WWWWNIGTPVQGLRWWWW";
    for (int copies = 2; copies <= 8; ++copies) {
        CSearch search(std::vector<std::string>(copies, sequence), 40, 2);
        ASSERT_EQ(search.tool->Run(), 1);
        EXPECT_EQ(search.tool->Diagonals().size(), (std::size_t{1} << copies) - 1) << copies;
    }
}

TEST(SimTool, DiagonalsBeyondTheBudgetStopTheSearchWithTheirOwnMessage) {
    for (int threads : {1, 2}) {
        CSearch overBudget({"WWWK", "KWWW", "KKWWW", "WWWKK"}, 33, 2);
        overBudget.tool->SetThreadCount(threads);
        overBudget.tool->SetMemoryBudget(1);
        EXPECT_EQ(overBudget.tool->Run(), 0);
        EXPECT_EQ(overBudget.tool->messages,
                  std::vector<std::string>{CSimTool::kTooManyDiagonalsMessage});
        EXPECT_EQ(overBudget.tool->LastFailure(), CSimTool::kTooManyDiagonals);
        EXPECT_EQ(overBudget.result.BlockCount(), 0);
    }
}

TEST(SimTool, SixtyFourMoleculesMakeOneSixtyFourMemberDiagonalAndMoreAreRefused) {
    EXPECT_EQ(CSimTool::TooManyMoleculesMessage(64), "");
    const std::string refusal = CSimTool::TooManyMoleculesMessage(65);
    EXPECT_NE(refusal.find("64"), std::string::npos);
    EXPECT_NE(refusal.find("65"), std::string::npos);

    const std::string sequence = "MKVLAAGIVGLLLAQRTEPWSHYCDFN";
    CSearch full(std::vector<std::string>(64, sequence), 33, 5);
    full.tool->SetThreadCount(2);
    ASSERT_EQ(full.tool->Run(), 1);
    EXPECT_EQ(full.tool->events[1], "begin Performing pairwise comparisons... 0..2016/1");
    ASSERT_EQ(full.tool->Diagonals().size(), 1u);
    EXPECT_EQ(full.tool->Diagonals()[0].MemberCount(), 64);
    ASSERT_EQ(full.result.BlockCount(), 1);
    const CSimBlock& block = *full.result.BlockAt(0);
    EXPECT_EQ(block.MemberCount(), 64);
    EXPECT_EQ(block.Width(CSimBlock::kOriginal), static_cast<int>(sequence.size()));
    std::vector<std::uint8_t> codes;
    ASSERT_TRUE(full.matrix.Encode(sequence, codes));
    int selfScore = 0;
    for (std::uint8_t code : codes)
        selfScore += full.matrix.Score(code, code);
    EXPECT_EQ(block.Score(CSimBlock::kOriginal), 2016 * selfScore);

    CSearch tooMany(std::vector<std::string>(65, sequence), 33, 5);
    EXPECT_EQ(tooMany.tool->Run(), 0);
    EXPECT_EQ(tooMany.tool->messages, std::vector<std::string>{refusal});
    EXPECT_EQ(tooMany.tool->events,
              (std::vector<std::string>{"status Initializing...", "finish 0"}));
}

}  // namespace

namespace {

TEST(SimMemoryStatus, FiguresCountSwapAndLowMeansUnderATwentieth) {
    const auto figures = ParseMemInfo(
        "MemTotal:       16000000 kB\nMemFree:          100000 kB\n"
        "MemAvailable:     700000 kB\nSwapTotal:       4000000 kB\nSwapFree:         250000 kB\n");
    ASSERT_TRUE(figures.has_value());
    EXPECT_EQ(figures->totalKb, 20000000u);
    EXPECT_EQ(figures->availableKb, 950000u);
    EXPECT_TRUE(IsLowOnMemory(*figures));
    EXPECT_FALSE(IsLowOnMemory({1000001, 20000000}));
    EXPECT_FALSE(ParseMemInfo("MemTotal: 100 kB\nMemFree: 50 kB\n").has_value());
}

}  // namespace
