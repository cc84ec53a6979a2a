#include "SimTool.h"

#include <algorithm>
#include <cstdio>
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

namespace {

// The approximate memory of a block of `members` members: the block and its four arrays.
std::size_t BlockBytes(std::size_t members) {
    constexpr std::size_t kAllocationOverhead = 16;
    return sizeof(CSimBlock) + sizeof(std::unique_ptr<CSimBlock>) + 4 * kAllocationOverhead +
           members * 4 * sizeof(std::int32_t);
}

}  // namespace

const char* const CSimTool::kLowMemoryMessage =
    "Your system is getting low of virtual memory.\nUnable to proceed with block searching.";
const char* const CSimTool::kTooManyDiagonalsMessage =
    "The molecules match each other at so many offsets that the search would find more "
    "diagonals and blocks than memory can hold.\nRaise the pairwise score cutoff, or search "
    "fewer closely related molecules.";

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
    SetStatusText("Initializing...");
    m_result->ClearBlocks();
    if (m_molecules.size() < 2)
        return Fail(kTooFewMolecules);
    if (m_molecules.size() > kMaxMolecules) {
        ShowMessage(TooManyMoleculesMessage(m_molecules.size()));
        return Fail(kTooManyMolecules);
    }
    try {
        if (!EncodeMolecules())
            return Fail(kUnencodableSequence);
        const CScoreGrid grid = GridOf(*m_matrix);
        CHitMasks masks(static_cast<int>(m_molecules.size()), LongestSequenceLength());
        bool cancelled = false;
        ComparePairs(grid, masks, cancelled);
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

void CSimTool::ComparePairs(const CScoreGrid& grid, CHitMasks& masks, bool& cancelled) {
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

    using COffsets = std::vector<std::int32_t>;
    const std::function<COffsets(std::size_t, int)> scan = [&](std::size_t k, int) {
        COffsets offsets;
        scanner.Scan(pairs[k].first, pairs[k].second, offsets);
        return offsets;
    };
    const std::function<bool(std::size_t, COffsets&)> merge = [&](std::size_t k,
                                                                  COffsets& offsets) {
        const auto [i, j] = pairs[k];
        ReportProgress("Performing pairwise comparisons (%d of %d)", static_cast<int>(k) + 1,
                       total);
        for (std::int32_t d : offsets) {
            m_hits.push_back({i, j, d});
            masks.Add(i, j, d);
        }
        m_pairOffsets[i][j] = std::move(offsets);
        cancelled = StepProgress();
        return !cancelled;
    };
    RunInOrder(WorkerCount(m_threadCount), pairs.size(), scan, merge);
}

bool CSimTool::ExpandDiagonals(const CHitMasks& masks, bool& cancelled) {
    const int total = static_cast<int>(m_hits.size());
    BeginPhase("Expanding diagonals...", 0, total, 1);
    const int workers = WorkerCount(m_threadCount);
    std::vector<CDiagonalExpander> expanders(
        workers, CDiagonalExpander(masks, m_pairOffsets, EffectiveMinSequences(), m_heldBytes));
    struct CExpansion {
        std::vector<CSimDiag> diagonals;
        bool aborted = false;
        bool outOfRoom = false;
    };
    const std::function<CExpansion(std::size_t, int)> expand = [&](std::size_t k, int worker) {
        CDiagonalExpander& expander = expanders[worker];
        CExpansion expansion;
        const std::function<bool()> shouldAbort = [&] {
            if (IsCancelled())
                return true;
            expansion.outOfRoom = OutOfRoom();
            return expansion.outOfRoom;
        };
        expansion.aborted = !expander.Expand(m_hits[k], shouldAbort, expansion.diagonals);
        return expansion;
    };
    bool stopped = false;
    const std::function<bool(std::size_t, CExpansion&)> keep = [&](std::size_t k,
                                                                   CExpansion& expansion) {
        ReportProgress("Expanding diagonals (hit %d of %d)", static_cast<int>(k) + 1, total);
        if (expansion.aborted) {
            if (expansion.outOfRoom)
                StopOutOfRoom();
            else
                m_failure = kCancelled;
            stopped = true;
            return false;
        }
        m_diagonals.insert(m_diagonals.end(), std::make_move_iterator(expansion.diagonals.begin()),
                           std::make_move_iterator(expansion.diagonals.end()));
        cancelled = StepProgress();
        return !cancelled;
    };
    RunInOrder(workers, m_hits.size(), expand, keep);
    return !stopped;
}

bool CSimTool::OutOfRoom() {
    return m_heldBytes.load() > m_memoryBudget || IsMemoryLow();
}

void CSimTool::StopOutOfRoom() {
    // What the search holds only grows, so the budget is still exceeded if it was.
    const bool overBudget = m_heldBytes.load() > m_memoryBudget;
    ShowMessage(overBudget ? kTooManyDiagonalsMessage : kLowMemoryMessage);
    m_failure = overBudget ? kTooManyDiagonals : kLowMemory;
}

bool CSimTool::ScanDiagonals(const CScoreGrid& grid, bool& cancelled) {
    const int total = static_cast<int>(m_diagonals.size());
    BeginPhase("Scanning each diagonal for blocks...", 0, total, 1);
    const std::vector<const std::vector<std::uint8_t>*> sequences = EncodedSequences();
    const int longest = LongestSequenceLength();
    const int workers = WorkerCount(m_threadCount);
    CPlacementJoins joins(sequences, grid, m_cutoff, m_pairOffsets);
    using CBlocks = std::vector<std::unique_ptr<CSimBlock>>;
    // Blocks are built by the workers; identifiers are handed out here, in diagonal order.
    const std::function<CBlocks(std::size_t, int)> scan = [&](std::size_t k, int) {
        std::vector<CBlockCandidate> candidates;
        ScanDiagonal(m_diagonals[k], longest, EffectiveMinSequences(), joins, candidates);
        CBlocks made;
        for (CBlockCandidate& candidate : candidates) {
            made.push_back(std::make_unique<CSimBlock>(CSimBlock::CDeferredIdentifier{}));
            made.back()->Init(std::move(candidate.molecules), std::move(candidate.starts),
                              candidate.width, candidate.score, 0);
        }
        return made;
    };
    CBlocks blocks;
    bool stopped = false;
    const std::function<bool(std::size_t, CBlocks&)> make = [&](std::size_t k, CBlocks& made) {
        ReportProgress("Scanning each diagonal for blocks (diagonal %d of %d)",
                       static_cast<int>(k) + 1, total);
        for (std::unique_ptr<CSimBlock>& block : made) {
            block->TakeNewIdentifier();
            m_heldBytes += BlockBytes(block->MemberCount());
            blocks.push_back(std::move(block));
        }
        if (OutOfRoom()) {
            StopOutOfRoom();
            stopped = true;
            return false;
        }
        cancelled = StepProgress();
        return !cancelled;
    };
    RunInOrder(workers, m_diagonals.size(), scan, make);
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
