#pragma once
// The two search values the block search engine reads, with the defaults and lower limits of
// the four values a project keeps for its searches.

#include <cstdint>
#include <string>

class CSimBlockParameters {
  public:
    CSimBlockParameters() = default;
    CSimBlockParameters(std::int32_t cutoff, std::int32_t minSequences)
        : m_cutoff(cutoff), m_minSequences(minSequences) {}

    // The score a run of matched residues must reach to count.
    std::int32_t Cutoff() const { return m_cutoff; }
    void SetCutoff(std::int32_t cutoff) { m_cutoff = cutoff; }
    // The least number of molecules a diagonal or block must span to be kept.
    std::int32_t MinSequences() const { return m_minSequences; }
    void SetMinSequences(std::int32_t minSequences) { m_minSequences = minSequences; }

    bool operator==(const CSimBlockParameters&) const = default;

  private:
    std::int32_t m_cutoff = 0;
    std::int32_t m_minSequences = 0;
};

// Defaults of a new project's search values. The default cutoff is the default matrix's own
// (CScoreMatrix::DefaultCutoff), 33 for "blosum62mt".
inline constexpr std::int32_t kDefaultMinSequences = 5;
inline constexpr double kDefaultExpectationLimit = 0.0001;
inline constexpr const char* kDefaultMatrixName = "blosum62mt";

// Lower limits of the integer values as the parameters page enforces them.
inline constexpr std::int32_t kMinCutoff = 1;
inline constexpr std::int32_t kMinMinSequences = 2;

// The refusal of an integer below its lower limit; the placeholder is the limit.
inline constexpr const char* kIntegerLimitFormat = "Please enter an integer >= %d";
// kIntegerLimitFormat with `lowerLimit` filled in.
std::string IntegerLimitMessage(std::int32_t lowerLimit);
