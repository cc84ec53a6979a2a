#pragma once
// The block search engine. Run() encodes the molecules, compares every pair along every
// diagonal (phase one), grows the pairwise hits into maximal multi-molecule diagonals (phase
// two) and scans each diagonal for blocks, which go into the result set in block order (phase
// three). Progress, cancellation and messages go through virtual operations that a front end
// (progress dialog, command line) overrides; the engine itself shows nothing.

#include <atomic>
#include <cstdarg>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "SimDiag.h"
#include "SimMol.h"
#include "SxMolEntry.h"

class CScoreMatrix;
class CSimBlockParameters;
class CSimBlockSet;
class CMemoryWatch;
class CScoreGrid;
class CHitMasks;

class CSimTool {
  public:
    // The masks that relate molecules hold one bit per molecule.
    static constexpr int kMaxMolecules = 64;
    static const char* const kLowMemoryMessage;
    static const char* const kTooManyDiagonalsMessage;
    static const char* const kTooManyHitsMessage;
    // How much the diagonals and blocks of one search may hold. Copies of one sequence that
    // resembles itself at other offsets can sit on either of two diagonals each, so their
    // maximal diagonals grow exponentially with their number; the budget stops such a search
    // early with its own message instead of when the whole system runs out.
    static constexpr std::size_t kDefaultMemoryBudget = std::size_t{128} << 20;
    // How many hits one search may find. A cutoff that every run of a few residues reaches
    // gives nearly every diagonal of every pair a hit, and long molecules have millions of
    // diagonals; each hit holds about a hundred bytes through the search.
    static constexpr std::size_t kDefaultHitLimit = std::size_t{1} << 21;

    // Why a run did not complete.
    enum Failure {
        kNoFailure,
        kTooFewMolecules,      // fewer than 2
        kTooManyMolecules,     // more than kMaxMolecules
        kUnencodableSequence,  // a residue outside the matrix alphabet (see FailedMolecule())
        kLowMemory,            // the system ran low on memory during expansion
        kTooManyDiagonals,     // the diagonals and blocks outgrew the memory budget
        kOutOfMemory,          // an allocation failed
        kCancelled,
        kTooManyHits,      // the pairwise comparisons found more hits than the hit limit
        kNotEnoughMemory,  // the molecules need more memory than the system has (refused)
    };

    // The message for a selection of `count` molecules that one search cannot hold; empty when
    // the count is fine. Callers show it before starting a search.
    static std::string TooManyMoleculesMessage(std::size_t count);
    // The message for a search refused because it needs `needed` bytes and `available` are left.
    static std::string NotEnoughMemoryMessage(std::uint64_t needed, std::uint64_t available);
    // The memory a search of molecules of these lengths allocates before it finds anything: the
    // hit masks, the encoded sequences, the query profiles of the vectorised pair scan (when
    // `profiles`, for an alphabet of `alphabetSize` letters) and each worker's scratch rows.
    static std::uint64_t EstimateSearchBytes(const std::vector<std::size_t>& lengths,
                                             int alphabetSize, bool profiles, int workers);

    // Copies the matrix and parameters, clears `result` and adds one entry per molecule, so that
    // molecule index i and entry index i name the same molecule.
    CSimTool(const CScoreMatrix& matrix, const CSimBlockParameters& parameters,
             const std::vector<CSxMolEntry>& molecules, CSimBlockSet* result);
    virtual ~CSimTool();
    CSimTool(const CSimTool&) = delete;
    CSimTool& operator=(const CSimTool&) = delete;

    // Runs the three phases; returns what Finish() returned: 1 for a complete run, else 0.
    int Run();

    // Worker threads of the phases; 0 (the default) uses every core.
    void SetThreadCount(int count) { m_threadCount = count; }
    void SetMemoryBudget(std::size_t bytes) { m_memoryBudget = bytes; }
    void SetHitLimit(std::size_t hits) { m_hitLimit = hits; }
    // Asks a running search to stop after its current item; safe from any thread.
    void RequestCancel() { m_cancelRequested.store(true, std::memory_order_relaxed); }

    Failure LastFailure() const { return m_failure; }
    // The molecule whose text did not encode (kUnencodableSequence), else -1.
    int FailedMolecule() const { return m_failedMolecule; }
    // L, the length of the longest sequence (0 for no molecules).
    int LongestSequenceLength() const;
    const std::vector<CSimMol>& Molecules() const { return m_molecules; }
    // Hits in the order found and diagonals in the order kept.
    const std::vector<CSimHit>& Hits() const { return m_hits; }
    const std::vector<CSimDiag>& Diagonals() const { return m_diagonals; }

  protected:
    // Progress of a phase: its text and range; StepProgress() is called once per item and
    // returns whether the user asked to cancel.
    virtual void BeginPhase(const std::string& text, int lower, int upper, int step);
    virtual bool StepProgress();
    // Called once at the end with 1 (complete) or 0; returns its argument.
    virtual int Finish(int ok);
    // printf-style progress text; the base does nothing. Overrides can use FormatText().
    virtual void ReportProgress(const char* format, ...) __attribute__((format(printf, 2, 3)));
    virtual void SetStatusText(const std::string& text);
    // The base answers whether RequestCancel() was called. Called from the worker threads of
    // the search too: overrides must be thread-safe (read an atomic flag).
    virtual bool IsCancelled();
    // A message the user must see (low memory): the GUI shows a box, the command line prints it.
    virtual void ShowMessage(const std::string& message);
    // Whether the system is low on memory; the base reads the system figures, at most a few
    // times a second. Called from the worker threads of the search too.
    virtual bool IsMemoryLow();
    // The bytes this process can still allocate; the base reads the system figures (and the
    // process's address-space limit). Asked once, before anything is allocated.
    virtual std::uint64_t AvailableMemory();
    // Starts a worker thread; throws std::system_error when the system refuses (the search then
    // goes on with the workers it has, or on the calling thread alone).
    virtual std::thread StartWorker(std::function<void()> work);

    static std::string FormatText(const char* format, va_list args);

  private:
    // Refuses molecules that need more memory than the system has; false when refused.
    bool FitsInMemory();
    bool EncodeMolecules();
    // The molecules' codes, in molecule order.
    std::vector<const std::vector<std::uint8_t>*> EncodedSequences() const;
    // The phases; false when the run must end at once (the failure is recorded).
    bool ComparePairs(const CScoreGrid& grid, CHitMasks& masks, bool& cancelled);
    bool ExpandDiagonals(const CHitMasks& masks, bool& cancelled);
    bool ScanDiagonals(const CScoreGrid& grid, bool& cancelled);
    int Fail(Failure failure);
    // Why the search cannot go on for lack of room: more hits than the limit, more diagonals and
    // blocks than the budget, or a system low on memory; kNoFailure when there is room.
    Failure OutOfRoom();
    // A check for the workers' long tasks: true when the search is cancelled or out of room,
    // and then `reason` says which.
    std::function<bool()> StopCheck(Failure& reason);
    // Ends a phase for `reason` (from StopCheck or OutOfRoom): a cancel is noted in
    // `cancelled`; anything else shows its message and records the failure. Returns whether the
    // run must end at once.
    bool EndPhase(Failure reason, bool& cancelled);
    // Runs a phase's tasks in order on the workers (see RunInOrder).
    template <class Result>
    void RunPhase(std::size_t count, const std::function<Result(std::size_t, int)>& task,
                  const std::function<bool(std::size_t, Result&)>& consume);
    int EffectiveMinSequences() const;

    std::unique_ptr<CScoreMatrix> m_matrix;
    int m_cutoff;
    int m_minSequences;
    std::vector<CSimMol> m_molecules;
    CSimBlockSet* m_result;
    int m_threadCount = 0;
    std::atomic<bool> m_cancelRequested{false};
    Failure m_failure = kNoFailure;
    int m_failedMolecule = -1;
    std::unique_ptr<CMemoryWatch> m_memoryWatch;
    std::size_t m_memoryBudget = kDefaultMemoryBudget;
    std::size_t m_hitLimit = kDefaultHitLimit;
    // Hits found by the workers of phase one so far, including those not yet merged.
    std::atomic<std::size_t> m_foundHits{0};
    // Why the workers were told to stop, once one of them was.
    std::atomic<Failure> m_stopReason{kNoFailure};
    // Held by the kept diagonals, the blocks made so far and the expansions' tables in use;
    // read by the workers.
    std::atomic<std::size_t> m_heldBytes{0};
    std::vector<CSimHit> m_hits;
    std::vector<CSimDiag> m_diagonals;
    // Hit offsets per pair a < b, ascending: pairOffsets[a][b].
    std::vector<std::vector<std::vector<std::int32_t>>> m_pairOffsets;
};
