#include "layout/ColourRules.h"

#include <cctype>

namespace {

// Combines the colours of the ranges for which `applies` holds.
template <class Predicate>
std::uint32_t CombineColours(std::span<const CSimColorSegment> segments,
                             const BlockColourLookup& colourOf, Predicate applies) {
    bool found = false;
    std::uint32_t colour = kNoColour;
    for (const CSimColorSegment& segment : segments) {
        if (!applies(segment))
            continue;
        const std::uint32_t c = colourOf(segment.BlockIdentifier());
        colour = found ? OverlayColour(colour, c) : c;
        found = true;
    }
    return colour;
}

}  // namespace

std::uint32_t OverlayColour(std::uint32_t soFar, std::uint32_t next) {
    return (~soFar & 0xFFFFFFu) ^ next;
}

std::uint32_t ColourAtPosition(int position, std::span<const CSimColorSegment> segments,
                               const BlockColourLookup& colourOf) {
    return CombineColours(segments, colourOf,
                          [position](const CSimSegment& s) { return s.Contains(position); });
}

std::uint32_t ColourAtColumn(const CSegmentRow& row, int column,
                             std::span<const CSimColorSegment> segments,
                             const BlockColourLookup& colourOf) {
    const CSeqSegment* segment = row.SegmentAtColumn(column);
    if (!segment)
        return kNoColour;
    if (!segment->IsGap()) {
        return ColourAtPosition(row.ColumnToPosition(column), segments, colourOf);
    }
    const int after = segment->position;
    return CombineColours(segments, colourOf, [after](const CSimSegment& s) {
        return s.Contains(after - 1) && s.Contains(after);
    });
}

std::uint32_t TextColourOf(char displayed, std::uint32_t textColour,
                           std::uint32_t linkedTextColour) {
    if (displayed == '-')
        return kNoColour;
    const auto c = static_cast<unsigned char>(displayed);
    return std::toupper(c) == c ? linkedTextColour : textColour;
}
