#pragma once
// The colours the alignment shows: a residue's text colour by its case, and the background of
// a column from the coloured block ranges of its row.

#include <cstdint>
#include <functional>
#include <span>

#include "SimBlock.h"
#include "layout/SegmentRow.h"

// A coloured range of a row: the residues of one block, drawn in that block's colour.
class CSimColorSegment : public CSimSegment {
  public:
    using CSimSegment::CSimSegment;
};

// The colour of the block with an identifier, or kNoColour when there is no such block.
using BlockColourLookup = std::function<std::uint32_t(int blockIdentifier)>;

// A further range's colour c laid over the colour x so far: (not x, limited to 24 bits) xor c.
std::uint32_t OverlayColour(std::uint32_t soFar, std::uint32_t next);

// The background of a residue: the first range that holds it gives its colour c; each further
// one turns the colour x so far into (not x, limited to 24 bits) xor c. kNoColour when no
// range holds it.
std::uint32_t ColourAtPosition(int position, std::span<const CSimColorSegment> segments,
                               const BlockColourLookup& colourOf);
// The background of a display column: the residue's colour, or for a gap column the colour of
// the ranges that hold both the residue before the gap and the one after it.
std::uint32_t ColourAtColumn(const CSegmentRow& row, int column,
                             std::span<const CSimColorSegment> segments,
                             const BlockColourLookup& colourOf);

// The text colour of a displayed character: kNoColour (the system text colour) for a gap, the
// linked colour for a character equal to its upper case, else the unlinked colour.
std::uint32_t TextColourOf(char displayed, std::uint32_t textColour,
                           std::uint32_t linkedTextColour);
