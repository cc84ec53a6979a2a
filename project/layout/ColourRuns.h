#pragma once
// The background colours of a row's residues worked out once from its coloured block ranges:
// runs of positions with one colour each, so that painting a column looks its colour up
// instead of going over every range.

#include <cstdint>
#include <span>
#include <vector>

#include "layout/ColourRules.h"

class CColourRuns {
  public:
    CColourRuns() = default;
    // The colours ColourAtPosition gives, for every position at once.
    CColourRuns(std::span<const CSimColorSegment> segments, const BlockColourLookup& colourOf);

    // The colour of residue `position`; kNoColour where no range applies.
    std::uint32_t ColourAt(int position) const;
    // Whether some range starts or ends at `position` (so that the residues on either side of
    // it may differ in which ranges hold them).
    bool IsBoundary(int position) const;

  private:
    std::vector<int> m_starts;             // sorted boundaries
    std::vector<std::uint32_t> m_colours;  // colour of [m_starts[i], m_starts[i + 1])
};
