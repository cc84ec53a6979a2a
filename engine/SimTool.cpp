#include "SimTool.h"

#include <algorithm>
#include <cstdio>
#include <limits>
#include <new>

#include "ScoreMatrix.h"
#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "search/DiagonalExpansion.h"
#include "search/DiagonalScan.h"
#include "search/HitMasks.h"
#include "search/MatrixAdapter.h"
#include "search/MemoryStatus.h"
#include "search/OrderedWork.h"
#include "search/PairScan.h"
#include "search/PairScanKernel.h"

namespace {

// The approximate memory of a block of `members` members: the block and its four arrays.
std::size_t BlockBytes(std::size_t members) {
    constexpr std::size_t kAllocationOverhead = 16;
    return sizeof(CSimBlock) + sizeof(std::unique_ptr<CSimBlock>) + 4 * kAllocationOverhead +
           members * 4 * sizeof(std::int32_t);
}

// Figures of a few significant digits: "6.7 GB", "350 MB".
std::string SizeText(std::uint64_t bytes) {
    constexpr double kGb = 1 << 30;
    constexpr double kMb = 1 << 20;
    char text[32];
    if (bytes >= kGb)
        std::snprintf(text, sizeof text, "%.1f GB", bytes / kGb);
    else
        std::snprintf(text, sizeof text, "%.0f MB", std::max(1.0, bytes / kMb));
    return text;
}

std::uint64_t RoundUpToProfile(std::uint64_t length) {
    return (length + kProfileAlignment - 1) / kProfileAlignment * kProfileAlignment;
}

}  // namespace

const char* const CSimTool::kLowMemoryMessage =
    "Your system is getting low of virtual memory.\nUnable to proceed with block searching.";
const char* const CSimTool::kTooManyDiagonalsMessage =
    "The molecules match each other at so many offsets that the search would find more "
    "diagonals and blocks than memory can hold.\nRaise the pairwise score cutoff, or search "
    "fewer closely related molecules.";

const char* const CSimTool::kTooManyHitsMessage =
    "The molecules match each other at so many offsets that the pairwise comparisons would find "
    "more hits than the search can expand.\nRaise the pairwise score cutoff, or search fewer or "
    "shorter molecules.";

std::string CSimTool::NotEnoughMemoryMessage(std::uint64_t needed, std::uint64_t available) {
    return "A search of these molecules needs about " + SizeText(needed) +
           " of memory before it can compare them, and " + SizeText(available) +
           " is available.\nSearch fewer or shorter molecules.";
}

std::uint64_t CSimTool::EstimateSearchBytes(const std::vector<std::size_t>& lengths,
                                            int alphabetSize, bool profiles, int workers) {
    std::uint64_t longest = 0;
    std::uint64_t bytes = 0;
    for (std::size_t length : lengths) {
        longest = std::max<std::uint64_t>(longest, length);
        bytes += length;  // the codes
        if (profiles)
            bytes += (alphabetSize + 1) * RoundUpToProfile(length) * sizeof(std::int16_t);
        // the lists of hit offsets per pair (empty until hits are found)
        bytes += lengths.size() * sizeof(std::vector<std::int32_t>);
    }
    bytes += lengths.size() * (2 * longest + 1) * sizeof(std::uint64_t);  // the hit masks
    // Per worker, a running score per profile column and a mark per diagonal of a pair.
    const std::uint64_t scratch =
        (RoundUpToProfile(longest) + 1) * sizeof(std::int16_t) + 2 * longest;
    return bytes + static_cast<std::uint64_t>(std::max(workers, 1)) * scratch;
}

std::string CSimTool::TooManyMoleculesMessage(std::size_t count) {
    if (count <= kMaxMolecules)
        return {};
    return "A block search can compare at most " + std::to_string(kMaxMolecules) + " molecules; " +
           std::to_string(count) + " were selected. Please select fewer molecules.";
}

CSimTool::CSimTool(const CScoreMatrix& matrix, const CSimBlockParameters& parameters,
                   const std::vector<CSxMolEntry>& molecules, CSimBlockSet* result)
    : m_matrix(std::make_unique<CScoreMatrix>(matrix)),
      m_cutoff(parameters.Cutoff()),
      m_minSequences(parameters.MinSequences()),
      m_result(result),
      m_memoryWatch(std::make_unique<CMemoryWatch>()) {
    m_result->Clear();
    for (const CSxMolEntry& molecule : molecules) {
        m_molecules.emplace_back(molecule.Name(), molecule.Sequence());
        m_result->AddMolecule(molecule);
    }
}

CSimTool::~CSimTool() = default;

int CSimTool::LongestSequenceLength() const {
    int longest = 0;
    for (const CSimMol& molecule : m_molecules)
        longest = std::max(longest, molecule.Length());
    return longest;
}

// A block needs two sequences, whatever smaller minimum the parameters hold.
int CSimTool::EffectiveMinSequences() const {
    return std::max(m_minSequences, 2);
}

int CSimTool::Run() {
    m_failure = kNoFailure;
    m_failedMolecule = -1;
    m_hits.clear();
    m_diagonals.clear();
    m_pairOffsets.clear();
    m_heldBytes = 0;
    m_foundHits = 0;
    m_stopReason = kNoFailure;
    SetStatusText("Initializing...");
    m_result->ClearBlocks();
    if (m_molecules.size() < 2)
        return Fail(kTooFewMolecules);
    if (m_molecules.size() > kMaxMolecules) {
        ShowMessage(TooManyMoleculesMessage(m_molecules.size()));
        return Fail(kTooManyMolecules);
    }
    try {
        if (!FitsInMemory())
            return Fail(kNotEnoughMemory);
        if (!EncodeMolecules())
            return Fail(kUnencodableSequence);
        const CScoreGrid grid = GridOf(*m_matrix);
        CHitMasks masks(static_cast<int>(m_molecules.size()), LongestSequenceLength());
        bool cancelled = false;
        if (!ComparePairs(grid, masks, cancelled))
            return Finish(0);
        if (!cancelled && !ExpandDiagonals(masks, cancelled))
            return Finish(0);
        if (!cancelled && !ScanDiagonals(grid, cancelled))
            return Finish(0);
        m_result->SetSearchParameters(m_cutoff, m_minSequences);
        if (cancelled)
            return Fail(kCancelled);
        return Finish(1);
    } catch (const std::bad_alloc&) {
        return Fail(kOutOfMemory);
    }
}

std::vector<const std::vector<std::uint8_t>*> CSimTool::EncodedSequences() const {
    std::vector<const std::vector<std::uint8_t>*> sequences;
    for (const CSimMol& molecule : m_molecules)
        sequences.push_back(&molecule.Codes());
    return sequences;
}

int CSimTool::Fail(Failure failure) {
    m_failure = failure;
    return Finish(0);
}

bool CSimTool::FitsInMemory() {
    std::vector<std::size_t> lengths;
    for (const CSimMol& molecule : m_molecules)
        lengths.push_back(molecule.Sequence().size());
    const bool profiles = CPairScanner::UsesProfiles(GridOf(*m_matrix), m_cutoff);
    const std::uint64_t needed =
        EstimateSearchBytes(lengths, m_matrix->Size(), profiles, WorkerCount(m_threadCount));
    const std::uint64_t available = AvailableMemory();
    if (needed <= available)
        return true;
    ShowMessage(NotEnoughMemoryMessage(needed, available));
    return false;
}

bool CSimTool::EncodeMolecules() {
    for (std::size_t i = 0; i < m_molecules.size(); ++i) {
        std::vector<std::uint8_t> codes;
        if (!m_matrix->Encode(m_molecules[i].Sequence(), codes)) {
            m_failedMolecule = static_cast<int>(i);
            return false;
        }
        m_molecules[i].SetCodes(std::move(codes));
    }
    return true;
}

bool CSimTool::ComparePairs(const CScoreGrid& grid, CHitMasks& masks, bool& cancelled) {
    const int count = static_cast<int>(m_molecules.size());
    std::vector<std::pair<int, int>> pairs;
    for (int i = 0; i < count; ++i) {
        for (int j = i + 1; j < count; ++j)
            pairs.emplace_back(i, j);
    }
    const int total = static_cast<int>(pairs.size());
    BeginPhase("Performing pairwise comparisons...", 0, total, 1);

    const CPairScanner scanner(grid, m_cutoff, EncodedSequences());
    m_pairOffsets.assign(count, std::vector<std::vector<std::int32_t>>(count));

    struct CComparison {
        std::vector<std::int32_t> offsets;
        Failure stop = kNoFailure;
    };
    const std::function<CComparison(std::size_t, int)> scan = [&](std::size_t k, int) {
        CComparison comparison;
        const std::function<bool()> shouldStop = StopCheck(comparison.stop);
        std::size_t counted = 0;
        const CScanProgress progress = [&](std::size_t hitsSoFar) {
            m_foundHits += hitsSoFar - counted;
            counted = hitsSoFar;
            return !shouldStop();
        };
        scanner.Scan(pairs[k].first, pairs[k].second, comparison.offsets, progress);
        return comparison;
    };
    bool stopped = false;
    const std::function<bool(std::size_t, CComparison&)> merge = [&](std::size_t k,
                                                                     CComparison& comparison) {
        const auto [i, j] = pairs[k];
        ReportProgress("Performing pairwise comparisons (%d of %d)", static_cast<int>(k) + 1,
                       total);
        if (comparison.stop != kNoFailure) {
            stopped = EndPhase(comparison.stop, cancelled);
            return false;
        }
        for (std::int32_t d : comparison.offsets) {
            m_hits.push_back({i, j, d});
            masks.Add(i, j, d);
        }
        m_pairOffsets[i][j] = std::move(comparison.offsets);
        cancelled = StepProgress();
        return !cancelled;
    };
    RunPhase(pairs.size(), scan, merge);
    return !stopped;
}

bool CSimTool::ExpandDiagonals(const CHitMasks& masks, bool& cancelled) {
    const int total = static_cast<int>(m_hits.size());
    BeginPhase("Expanding diagonals...", 0, total, 1);
    const int workers = WorkerCount(m_threadCount);
    std::vector<CDiagonalExpander> expanders(
        workers, CDiagonalExpander(masks, m_pairOffsets, EffectiveMinSequences(), m_heldBytes));
    struct CExpansion {
        std::vector<CSimDiag> diagonals;
        Failure stop = kNoFailure;
    };
    const std::function<CExpansion(std::size_t, int)> expand = [&](std::size_t k, int worker) {
        CExpansion expansion;
        expanders[worker].Expand(m_hits[k], StopCheck(expansion.stop), expansion.diagonals);
        return expansion;
    };
    bool stopped = false;
    const std::function<bool(std::size_t, CExpansion&)> keep = [&](std::size_t k,
                                                                   CExpansion& expansion) {
        ReportProgress("Expanding diagonals (hit %d of %d)", static_cast<int>(k) + 1, total);
        if (expansion.stop != kNoFailure) {
            stopped = EndPhase(expansion.stop, cancelled);
            return false;
        }
        m_diagonals.insert(m_diagonals.end(), std::make_move_iterator(expansion.diagonals.begin()),
                           std::make_move_iterator(expansion.diagonals.end()));
        cancelled = StepProgress();
        return !cancelled;
    };
    RunPhase(m_hits.size(), expand, keep);
    return !stopped;
}

CSimTool::Failure CSimTool::OutOfRoom() {
    if (m_foundHits.load() > m_hitLimit)
        return kTooManyHits;
    if (m_heldBytes.load() > m_memoryBudget)
        return kTooManyDiagonals;
    return IsMemoryLow() ? kLowMemory : kNoFailure;
}

std::function<bool()> CSimTool::StopCheck(Failure& reason) {
    return [this, &reason] {
        reason = m_stopReason.load();
        if (reason == kNoFailure) {
            reason = IsCancelled() ? kCancelled : OutOfRoom();
            // The first reason seen stops every worker: memory that a stopped task gives back
            // must not let the others go on.
            Failure none = kNoFailure;
            if (reason != kNoFailure && !m_stopReason.compare_exchange_strong(none, reason))
                reason = none;
        }
        return reason != kNoFailure;
    };
}

bool CSimTool::EndPhase(Failure reason, bool& cancelled) {
    if (reason == kCancelled) {
        cancelled = true;
        return false;
    }
    const char* message = reason == kTooManyHits        ? kTooManyHitsMessage
                          : reason == kTooManyDiagonals ? kTooManyDiagonalsMessage
                                                        : kLowMemoryMessage;
    ShowMessage(message);
    m_failure = reason;
    return true;
}

template <class Result>
void CSimTool::RunPhase(std::size_t count, const std::function<Result(std::size_t, int)>& task,
                        const std::function<bool(std::size_t, Result&)>& consume) {
    const CThreadStarter start = [this](std::function<void()> work) {
        return StartWorker(std::move(work));
    };
    RunInOrder(WorkerCount(m_threadCount), count, task, consume, start);
}

bool CSimTool::ScanDiagonals(const CScoreGrid& grid, bool& cancelled) {
    const int total = static_cast<int>(m_diagonals.size());
    BeginPhase("Scanning each diagonal for blocks...", 0, total, 1);
    const std::vector<const std::vector<std::uint8_t>*> sequences = EncodedSequences();
    const int longest = LongestSequenceLength();
    CPlacementJoins joins(sequences, grid, m_cutoff, m_pairOffsets);
    using CBlocks = std::vector<std::unique_ptr<CSimBlock>>;
    struct CScan {
        CBlocks made;
        Failure stop = kNoFailure;
    };
    // Blocks are built by the workers; identifiers are handed out here, in diagonal order.
    const std::function<CScan(std::size_t, int)> scan = [&](std::size_t k, int) {
        CScan result;
        std::vector<CBlockCandidate> candidates;
        if (!ScanDiagonal(m_diagonals[k], longest, EffectiveMinSequences(), joins,
                          StopCheck(result.stop), candidates))
            return result;
        for (CBlockCandidate& candidate : candidates) {
            result.made.push_back(std::make_unique<CSimBlock>(CSimBlock::CDeferredIdentifier{}));
            result.made.back()->Init(std::move(candidate.molecules), std::move(candidate.starts),
                                     candidate.width, candidate.score, 0);
        }
        return result;
    };
    CBlocks blocks;
    bool stopped = false;
    const std::function<bool(std::size_t, CScan&)> make = [&](std::size_t k, CScan& result) {
        ReportProgress("Scanning each diagonal for blocks (diagonal %d of %d)",
                       static_cast<int>(k) + 1, total);
        for (std::unique_ptr<CSimBlock>& block : result.made) {
            block->TakeNewIdentifier();
            m_heldBytes += BlockBytes(block->MemberCount());
            blocks.push_back(std::move(block));
        }
        const Failure stop = result.stop != kNoFailure ? result.stop : OutOfRoom();
        if (stop != kNoFailure) {
            stopped = EndPhase(stop, cancelled);
            return false;
        }
        cancelled = StepProgress();
        return !cancelled;
    };
    RunPhase(m_diagonals.size(), scan, make);
    if (stopped)
        return false;
    m_result->AddBlocksSorted(std::move(blocks));
    return true;
}

void CSimTool::BeginPhase(const std::string&, int, int, int) {}

bool CSimTool::StepProgress() {
    return IsCancelled();
}

int CSimTool::Finish(int ok) {
    return ok;
}

void CSimTool::ReportProgress(const char*, ...) {}

void CSimTool::SetStatusText(const std::string&) {}

bool CSimTool::IsCancelled() {
    return m_cancelRequested.load(std::memory_order_relaxed);
}

void CSimTool::ShowMessage(const std::string&) {}

bool CSimTool::IsMemoryLow() {
    return m_memoryWatch->IsLow();
}

std::uint64_t CSimTool::AvailableMemory() {
    // Without the figures the search goes on: it cannot tell, and must not refuse to run.
    return AvailableMemoryBytes().value_or(std::numeric_limits<std::uint64_t>::max());
}

std::thread CSimTool::StartWorker(std::function<void()> work) {
    return StartThread(std::move(work));
}

std::string CSimTool::FormatText(const char* format, va_list args) {
    va_list copy;
    va_copy(copy, args);
    const int length = std::vsnprintf(nullptr, 0, format, copy);
    va_end(copy);
    if (length <= 0)
        return {};
    std::string text(static_cast<std::size_t>(length) + 1, '\0');
    std::vsnprintf(text.data(), text.size(), format, args);
    text.resize(static_cast<std::size_t>(length));
    return text;
}
