#pragma once
// The block search engine. Run() encodes the molecules, compares every pair along every
// diagonal (phase one), grows the pairwise hits into maximal multi-molecule diagonals (phase
// two) and scans each diagonal for blocks, which go into the result set in block order (phase
// three). Progress, cancellation and messages go through virtual operations that a front end
// (progress dialog, command line) overrides; the engine itself shows nothing.

#include <atomic>
#include <cstdarg>
#include <cstdint>
#include <memory>
#include <string>
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
    // How much the diagonals and blocks of one search may hold. Copies of one sequence that
    // resembles itself at other offsets can sit on either of two diagonals each, so their
    // maximal diagonals grow exponentially with their number; the budget stops such a search
    // early with its own message instead of when the whole system runs out.
    static constexpr std::size_t kDefaultMemoryBudget = std::size_t{128} << 20;

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
    };

    // The message for a selection of `count` molecules that one search cannot hold; empty when
    // the count is fine. Callers show it before starting a search.
    static std::string TooManyMoleculesMessage(std::size_t count);

    // Copies the matrix and parameters, clears `result` and adds one entry per molecule, so that
    // molecule index i and entry index i name the same molecule.
    CSimTool(const CScoreMatrix& matrix, const CSimBlockParameters& parameters,
             const std::vector<CSxMolEntry>& molecules, CSimBlockSet* result);
    virtual ~CSimTool();
    CSimTool(const CSimTool&) = delete;
    CSimTool& operator=(const CSimTool&) = delete;

    // Runs the three phases; returns what Finish() returned: 1 for a complete run, else 0.
    int Run();

    // Worker threads of phase one; 0 (the default) uses every core.
    void SetThreadCount(int count) { m_threadCount = count; }
    void SetMemoryBudget(std::size_t bytes) { m_memoryBudget = bytes; }
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

    static std::string FormatText(const char* format, va_list args);

  private:
    bool EncodeMolecules();
    // The molecules' codes, in molecule order.
    std::vector<const std::vector<std::uint8_t>*> EncodedSequences() const;
    // The phases; false when the run must end at once (the failure is recorded).
    void ComparePairs(const CScoreGrid& grid, CHitMasks& masks, bool& cancelled);
    bool ExpandDiagonals(const CHitMasks& masks, bool& cancelled);
    bool ScanDiagonals(const CScoreGrid& grid, bool& cancelled);
    int Fail(Failure failure);
    // Whether the search holds more than its budget or the system is low on memory.
    bool OutOfRoom();
    // Shows the message for the reason OutOfRoom() answered true and records the failure.
    void StopOutOfRoom();
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
    // Held by the kept diagonals and the blocks made so far; read by the workers.
    std::atomic<std::size_t> m_heldBytes{0};
    std::vector<CSimHit> m_hits;
    std::vector<CSimDiag> m_diagonals;
    // Hit offsets per pair a < b, ascending: pairOffsets[a][b].
    std::vector<std::vector<std::vector<std::int32_t>>> m_pairOffsets;
};
