// What stops a search whose hits, diagonals or memory would explode, and how a search goes on
// when the system refuses it threads: the limits are made small here, so that small inputs reach
// them.

#include <gtest/gtest.h>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <fstream>
#include <limits>
#include <new>
#include <random>
#include <set>
#include <system_error>
#include <thread>

#include "ScoreMatrix.h"
#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "SimTool.h"
#include "engine/SearchEntries.h"
#include "search/DiagonalExpansion.h"
#include "search/DiagonalScan.h"
#include "search/HitMasks.h"
#include "search/MatrixAdapter.h"
#include "search/MemoryStatus.h"
#include "search/OrderedWork.h"
#include "search/PairScan.h"

namespace {

constexpr std::uint64_t kMb = std::uint64_t{1} << 20;

// Records phases and messages, never finds the machine low on memory, and lets a test set the
// memory available, refuse threads after a number of them, or cancel at the n-th check.
class CLimitTool : public CSimTool {
  public:
    using CSimTool::CSimTool;

    std::vector<std::string> phases;
    std::vector<std::string> messages;
    std::uint64_t available = std::numeric_limits<std::uint64_t>::max();
    int threadsAllowed = -1;  // StartWorker refuses once this many started (-1: never)
    int started = 0;
    int cancelAtCheck = -1;  // IsCancelled answers true from this call on (-1: never)
    std::atomic<int> checks{0};

  protected:
    void BeginPhase(const std::string& text, int, int, int) override { phases.push_back(text); }
    void ShowMessage(const std::string& message) override { messages.push_back(message); }
    bool IsMemoryLow() override { return false; }
    bool IsCancelled() override { return cancelAtCheck >= 0 && ++checks >= cancelAtCheck; }
    std::uint64_t AvailableMemory() override { return available; }
    std::thread StartWorker(std::function<void()> work) override {
        if (threadsAllowed >= 0 && started >= threadsAllowed)
            throw std::system_error(
                std::make_error_code(std::errc::resource_unavailable_try_again));
        ++started;
        return CSimTool::StartWorker(std::move(work));
    }
};

struct CSearch {
    CScoreMatrix matrix{"blosum62mt"};
    CSimBlockSet result;
    std::unique_ptr<CLimitTool> tool;

    CSearch(const std::vector<std::string>& sequences, int cutoff, int minSequences) {
        tool = std::make_unique<CLimitTool>(matrix, CSimBlockParameters(cutoff, minSequences),
                                            Entries(sequences), &result);
    }
};

// Tryptophans score 11 against each other under blosum62, so with cutoff 11 every diagonal of
// two runs of W has a hit: a pair of lengths a and b has a + b - 1 hits.
std::size_t AllDiagonals(const std::vector<std::string>& sequences) {
    std::size_t count = 0;
    for (std::size_t i = 0; i < sequences.size(); ++i) {
        for (std::size_t j = i + 1; j < sequences.size(); ++j)
            count += sequences[i].size() + sequences[j].size() - 1;
    }
    return count;
}

std::vector<std::uint8_t> Encoded(const CScoreMatrix& matrix, const std::string& text) {
    std::vector<std::uint8_t> codes;
    EXPECT_TRUE(matrix.Encode(text, codes));
    return codes;
}

TEST(SearchLimits, MoreHitsThanTheLimitStopThePairwiseComparisonsAndSaySo) {
    const std::vector<std::string> runs = {std::string(10, 'W'), std::string(12, 'W'),
                                           std::string(7, 'W'), std::string(9, 'W')};
    const std::size_t hits = AllDiagonals(runs);
    for (int threads : {1, 2}) {
        CSearch atLimit(runs, 11, 2);
        atLimit.tool->SetThreadCount(threads);
        atLimit.tool->SetHitLimit(hits);
        EXPECT_EQ(atLimit.tool->Run(), 1);
        EXPECT_EQ(atLimit.tool->Hits().size(), hits);

        // One hit fewer: the search stops on the hits, whatever the diagonal budget.
        for (std::size_t budget : {CSimTool::kDefaultMemoryBudget, std::size_t{1}}) {
            CSearch over(runs, 11, 2);
            over.tool->SetThreadCount(threads);
            over.tool->SetHitLimit(hits - 1);
            over.tool->SetMemoryBudget(budget);
            EXPECT_EQ(over.tool->Run(), 0);
            EXPECT_EQ(over.tool->LastFailure(), CSimTool::kTooManyHits);
            EXPECT_EQ(over.tool->messages, std::vector<std::string>{CSimTool::kTooManyHitsMessage});
            EXPECT_EQ(over.tool->phases,
                      std::vector<std::string>{"Performing pairwise comparisons..."});
            EXPECT_TRUE(over.tool->Diagonals().empty());
            EXPECT_EQ(over.result.BlockCount(), 0);
        }
    }
    EXPECT_NE(std::string(CSimTool::kTooManyHitsMessage).find("hits"), std::string::npos);
    EXPECT_EQ(std::string(CSimTool::kTooManyDiagonalsMessage).find("hits"), std::string::npos);
}

// Two 6,000-residue molecules: 36 million residue pairs, more than one scan step.
TEST(SearchLimits, TheScanOfOneLongPairReportsItsHitsAsItGoesAndStopsWhenTold) {
    const CScoreMatrix matrix("blosum62mt");
    const std::vector<std::uint8_t> runs = Encoded(matrix, std::string(6000, 'W'));
    const std::vector<const std::vector<std::uint8_t>*> sequences{&runs, &runs};
    // The same scores times 1000 do not fit the vector lanes: the scalar scan.
    std::vector<int> scaled = matrix.Scores();
    for (int& score : scaled)
        score *= 1000;
    const CScoreGrid grid = GridOf(matrix);
    const CScoreGrid scaledGrid(matrix.Size(), scaled);
    const CPairScanner vectorScan(grid, 11, sequences);
    const CPairScanner scalarScan(scaledGrid, 11 * 1000, sequences);
    EXPECT_FALSE(scalarScan.IsVectorised());
    for (const CPairScanner* scanner : {&vectorScan, &scalarScan}) {
        std::vector<std::size_t> told;
        const CScanProgress record = [&](std::size_t hits) {
            told.push_back(hits);
            return true;
        };
        std::vector<std::int32_t> offsets;
        ASSERT_TRUE(scanner->Scan(0, 1, offsets, record));
        EXPECT_EQ(offsets.size(), 11999u);
        ASSERT_GE(told.size(), 3u);  // at least one step within the scan, and the end
        EXPECT_TRUE(std::is_sorted(told.begin(), told.end()));
        EXPECT_LT(told.front(), offsets.size());
        EXPECT_EQ(told.back(), offsets.size());

        told.clear();
        const CScanProgress stopEarly = [&](std::size_t hits) {
            told.push_back(hits);
            return hits < 3000;
        };
        EXPECT_FALSE(scanner->Scan(0, 1, offsets, stopEarly));
        EXPECT_GE(told.back(), 3000u);
        EXPECT_LT(told.back(), 11999u);
    }

    // The search itself stops inside its only pair: nothing is merged.
    CSearch search({std::string(6000, 'W'), std::string(6000, 'W')}, 11, 2);
    search.tool->SetHitLimit(100);
    EXPECT_EQ(search.tool->Run(), 0);
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kTooManyHits);
    EXPECT_TRUE(search.tool->Hits().empty());

    // And so does a cancel.
    CSearch cancelled({std::string(6000, 'W'), std::string(6000, 'W')}, 11, 2);
    cancelled.tool->cancelAtCheck = 1;
    EXPECT_EQ(cancelled.tool->Run(), 0);
    EXPECT_EQ(cancelled.tool->LastFailure(), CSimTool::kCancelled);
    EXPECT_TRUE(cancelled.tool->Hits().empty());
}

TEST(SearchLimits, AScanInStepsFindsTheSameHitsAsTheScalarScan) {
    const CScoreMatrix matrix("blosum62mt");
    std::mt19937 random(11);
    std::uniform_int_distribution<int> code(1, 20);
    std::vector<std::vector<std::uint8_t>> codes{std::vector<std::uint8_t>(5000),
                                                 std::vector<std::uint8_t>(4500)};
    for (auto& sequence : codes) {
        for (auto& residue : sequence)
            residue = static_cast<std::uint8_t>(code(random));
    }
    const CScoreGrid grid = GridOf(matrix);
    const CPairScanner scanner(grid, 30, {&codes[0], &codes[1]});
    std::size_t steps = 0;
    std::vector<std::int32_t> offsets;
    ASSERT_TRUE(scanner.Scan(0, 1, offsets, [&](std::size_t) { return ++steps > 0; }));
    EXPECT_GE(steps, 2u);
    const std::vector<std::int32_t> expected = ScanPairScalar(codes[0], codes[1], grid, 30);
    EXPECT_EQ(offsets, expected);
    EXPECT_FALSE(expected.empty());
}

// Every pair of n runs of W has a hit at every offset. The hit (0, 1, 0) can be joined by every
// other run at each offset that both 0 and 1 reach: 2L - 1 placements per run.
TEST(SearchLimits, AnExpansionsTableCountsTowardsTheBudgetBeforeItIsBuilt) {
    constexpr int kRuns = 5;
    constexpr int kLength = 10;
    CHitMasks masks(kRuns, kLength);
    std::vector<std::vector<std::vector<std::int32_t>>> pairOffsets(
        kRuns, std::vector<std::vector<std::int32_t>>(kRuns));
    for (int a = 0; a < kRuns; ++a) {
        for (int b = a + 1; b < kRuns; ++b) {
            for (int d = 1 - kLength; d < kLength; ++d) {
                masks.Add(a, b, d);
                pairOffsets[a][b].push_back(d);
            }
        }
    }
    const std::size_t placements = (kRuns - 2) * (2 * kLength - 1);
    const std::size_t tableBytes = placements * ((placements + 63) / 64) * sizeof(std::uint64_t);

    std::atomic<std::size_t> held{0};
    CDiagonalExpander expander(masks, pairOffsets, 2, held);
    std::vector<std::size_t> seen;
    const std::function<bool()> stopAtThirdCheck = [&] {
        seen.push_back(held.load());
        return seen.size() == 3;
    };
    std::vector<CSimDiag> kept;
    EXPECT_FALSE(expander.Expand({0, 1, 0}, stopAtThirdCheck, kept));
    ASSERT_EQ(seen.size(), 3u);
    EXPECT_EQ(seen[0], 0u);
    EXPECT_EQ(seen[1], tableBytes);  // before the table is filled
    EXPECT_TRUE(kept.empty());
    EXPECT_EQ(held.load(), 0u);  // given back

    // Unstopped, only what was kept stays counted.
    const std::function<bool()> goOn = [] { return false; };
    ASSERT_TRUE(expander.Expand({0, 1, 0}, goOn, kept));
    ASSERT_FALSE(kept.empty());
    std::size_t keptBytes = 0;
    for (const CSimDiag& diagonal : kept)
        keptBytes += CDiagonalExpander::BytesOf(diagonal);
    EXPECT_EQ(held.load(), keptBytes);
}

TEST(SearchLimits, ADiagonalsScanStopsBetweenItsMemberPairs) {
    const CScoreMatrix matrix("blosum62mt");
    const std::vector<std::uint8_t> runs = Encoded(matrix, std::string(1000, 'W'));
    const std::vector<const std::vector<std::uint8_t>*> sequences{&runs, &runs, &runs};
    const std::vector<std::vector<std::vector<std::int32_t>>> offsets(
        3, std::vector<std::vector<std::int32_t>>(3, std::vector<std::int32_t>{0}));
    CSimDiag diagonal;
    diagonal.members = {0, 1, 2};
    diagonal.offsets = {0, 0, 0};
    const CScoreGrid grid = GridOf(matrix);

    CPlacementJoins joins(sequences, grid, 11, offsets);
    for (int stopAt : {1, 2, 3}) {
        int checks = 0;
        const std::function<bool()> stop = [&] { return ++checks == stopAt; };
        std::vector<CBlockCandidate> blocks;
        EXPECT_FALSE(ScanDiagonal(diagonal, 1000, 2, joins, stop, blocks));
        EXPECT_EQ(checks, stopAt);
        EXPECT_TRUE(blocks.empty());
    }
    // A scan stopped part way leaves the joins it made usable.
    const std::function<bool()> goOn = [] { return false; };
    std::vector<CBlockCandidate> blocks;
    ASSERT_TRUE(ScanDiagonal(diagonal, 1000, 2, joins, goOn, blocks));
    ASSERT_EQ(blocks.size(), 1u);
    EXPECT_EQ(blocks[0].molecules, (std::vector<std::int32_t>{0, 1, 2}));
    EXPECT_EQ(blocks[0].width, 1000);
    EXPECT_EQ(blocks[0].score, 3 * 1000 * 11);
}

// A failing starter: refuses (as the system does) once `allowed` threads were started.
CThreadStarter RefusingAfter(int allowed, std::atomic<int>& started) {
    return [allowed, &started](std::function<void()> work) {
        if (started.load() >= allowed)
            throw std::system_error(
                std::make_error_code(std::errc::resource_unavailable_try_again));
        ++started;
        return std::thread(std::move(work));
    };
}

TEST(SearchLimits, RefusedThreadsLeaveTheWorkToThoseStartedOrToTheCallingThread) {
    const std::thread::id caller = std::this_thread::get_id();
    for (int allowed : {0, 1, 2}) {
        std::atomic<int> started{0};
        std::atomic<unsigned> workers{0};  // a bit per worker index seen
        std::atomic<bool> onCaller{false};
        const std::function<int(std::size_t, int)> task = [&](std::size_t i, int worker) {
            workers |= 1u << worker;
            if (std::this_thread::get_id() == caller)
                onCaller = true;
            return static_cast<int>(i) * 3;
        };
        std::size_t next = 0;
        const std::function<bool(std::size_t, int&)> consume = [&](std::size_t i, int& value) {
            EXPECT_EQ(i, next++);
            EXPECT_EQ(value, static_cast<int>(i) * 3);
            return true;
        };
        EXPECT_TRUE(RunInOrder(4, 500, task, consume, RefusingAfter(allowed, started)));
        EXPECT_EQ(next, 500u) << allowed;
        EXPECT_EQ(started.load(), allowed);
        // With no worker the calling thread does the work itself, as worker 0.
        EXPECT_EQ(onCaller.load(), allowed == 0) << allowed;
        // Worker indices stay below the number started (one when only the caller worked).
        EXPECT_NE(workers.load(), 0u);
        EXPECT_EQ(workers.load() & ~((1u << std::max(allowed, 1)) - 1), 0u) << allowed;
    }
}

TEST(SearchLimits, OtherFailuresWhileWorkersRunEndTheWorkWithTheirError) {
    std::atomic<int> started{0};
    const CThreadStarter failing = [&](std::function<void()> work) {
        if (started.load() == 1)
            throw std::bad_alloc();
        ++started;
        return std::thread(std::move(work));
    };
    const std::function<int(std::size_t, int)> task = [](std::size_t i, int) {
        return static_cast<int>(i);
    };
    const std::function<bool(std::size_t, int&)> consume = [](std::size_t, int&) { return true; };
    // The started worker is joined before the error leaves (else the program would end).
    EXPECT_THROW(RunInOrder(4, 500, task, consume, failing), std::bad_alloc);

    // So are the workers when taking a result fails.
    const std::function<bool(std::size_t, int&)> failingConsume = [](std::size_t i, int&) {
        if (i == 100)
            throw std::bad_alloc();
        return true;
    };
    EXPECT_THROW(RunInOrder(4, 500, task, failingConsume), std::bad_alloc);
}

TEST(SearchLimits, ASearchWhoseThreadsAreRefusedFindsTheSameResult) {
    const std::vector<std::string> family = {
        "MKVLAAGIVGLLLAQRTEPWSHYCDFN", "MKVLSAGIVGLLLAQKTEPWSHYCDFN", "PPMKVLAAGIVGLLLAQRTEPWAHYCD",
        "MKVLAAGIVGLMLAQRTEPWSHYCDFNGG", "GGGMKVLAAGLVGLLLAQRTEPWSHY"};
    CSearch alone(family, 33, 3);
    alone.tool->SetThreadCount(1);
    ASSERT_EQ(alone.tool->Run(), 1);
    ASSERT_GT(alone.result.BlockCount(), 0);
    for (int allowed : {0, 1}) {
        CSearch refused(family, 33, 3);
        refused.tool->SetThreadCount(4);
        refused.tool->threadsAllowed = allowed;
        ASSERT_EQ(refused.tool->Run(), 1) << allowed;
        EXPECT_EQ(refused.tool->Hits(), alone.tool->Hits());
        EXPECT_EQ(refused.tool->Diagonals(), alone.tool->Diagonals());
        ASSERT_EQ(refused.result.BlockCount(), alone.result.BlockCount());
        for (int i = 0; i < alone.result.BlockCount(); ++i) {
            EXPECT_EQ(refused.result.BlockAt(i)->OriginalStarts(),
                      alone.result.BlockAt(i)->OriginalStarts());
        }
    }
}

TEST(SearchLimits, TheMemoryEstimateGrowsWithTheLengthsAndHoldsTheProfiles) {
    constexpr std::size_t kHuge = 50'000'000;
    const std::uint64_t huge = CSimTool::EstimateSearchBytes({kHuge, kHuge}, 23, true, 2);
    // The hit masks (8 bytes for each of 2L + 1 offsets per molecule) and the query profiles
    // (2 bytes per residue for each of 24 codes) alone take 6.4 GB.
    const std::uint64_t masks = 2 * (2 * kHuge + 1) * 8;
    const std::uint64_t profiles = 2 * 24 * kHuge * 2;
    EXPECT_GE(huge, masks + profiles);
    // Little else: the codes, and per worker a running score and a mark per residue.
    EXPECT_LE(huge, masks + profiles + 2 * kHuge + 2 * (4 * kHuge + 1024));
    EXPECT_EQ(huge - CSimTool::EstimateSearchBytes({kHuge, kHuge}, 23, false, 2), profiles);
    EXPECT_GT(CSimTool::EstimateSearchBytes({kHuge, kHuge}, 23, true, 8), huge);
    EXPECT_LT(CSimTool::EstimateSearchBytes({kHuge, kHuge / 2}, 23, true, 2), huge);
    EXPECT_GT(CSimTool::EstimateSearchBytes({kHuge, kHuge, 10}, 23, true, 2), huge);

    const std::string message = CSimTool::NotEnoughMemoryMessage(15 * (kMb << 9), 3 * (kMb << 9));
    EXPECT_NE(message.find("about 7.5 GB"), std::string::npos) << message;
    EXPECT_NE(message.find("1.5 GB is available"), std::string::npos) << message;
    EXPECT_NE(CSimTool::NotEnoughMemoryMessage(huge, 300 * kMb).find("300 MB"), std::string::npos);
}

TEST(SearchLimits, MoleculesThatNeedMoreMemoryThanThereIsAreRefusedBeforeAnythingRuns) {
    const std::string long1(5'000'000, 'A');
    const std::string long2(4'000'000, 'C');
    CSearch search({long1, long2}, 33, 2);
    search.tool->SetThreadCount(2);
    search.tool->available = 64 * kMb;
    EXPECT_EQ(search.tool->Run(), 0);
    EXPECT_EQ(search.tool->LastFailure(), CSimTool::kNotEnoughMemory);
    const std::uint64_t needed =
        CSimTool::EstimateSearchBytes({long1.size(), long2.size()}, search.matrix.Size(),
                                      CPairScanner::UsesProfiles(GridOf(search.matrix), 33), 2);
    EXPECT_EQ(search.tool->messages,
              std::vector<std::string>{CSimTool::NotEnoughMemoryMessage(needed, 64 * kMb)});
    EXPECT_TRUE(search.tool->phases.empty());
    EXPECT_TRUE(search.tool->Hits().empty());

    // Exactly enough memory is enough.
    const std::vector<std::string> small = {"MKVLWWWCAGHY", "MKVLWWWCAGHY"};
    const std::uint64_t smallNeeds = CSimTool::EstimateSearchBytes(
        {12, 12}, search.matrix.Size(), CPairScanner::UsesProfiles(GridOf(search.matrix), 33), 1);
    for (std::uint64_t available : {smallNeeds, smallNeeds - 1}) {
        CSearch fits(small, 33, 2);
        fits.tool->SetThreadCount(1);
        fits.tool->available = available;
        EXPECT_EQ(fits.tool->Run(), available == smallNeeds ? 1 : 0);
    }
}

TEST(SearchLimits, TheAvailableMemoryRespectsTheAddressSpaceLimit) {
    const auto unlimited = AvailableMemoryBytes();
    ASSERT_TRUE(unlimited.has_value());
    EXPECT_GT(*unlimited, 0u);
    // The limit is set in a child, so that this process keeps its own.
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        // 256 MB more than the child's address space now.
        std::uint64_t pages = 0;
        std::ifstream("/proc/self/statm") >> pages;
        constexpr std::uint64_t kRoom = 256 * kMb;
        const rlim_t size = pages * static_cast<std::uint64_t>(sysconf(_SC_PAGESIZE)) + kRoom;
        const rlimit limit{size, size};
        if (pages == 0 || setrlimit(RLIMIT_AS, &limit) != 0)
            _exit(2);
        const auto available = AvailableMemoryBytes();
        _exit(available && *available <= kRoom && *available > kRoom / 2 ? 0 : 1);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

}  // namespace
