#include "layout/ColourRuns.h"

#include <algorithm>
#include <set>

namespace {

constexpr std::uint32_t kLowBits = 0xFFFFFFu;

}  // namespace

CColourRuns::CColourRuns(std::span<const CSimColorSegment> segments,
                         const BlockColourLookup& colourOf) {
    struct Event {
        int position;
        int segment;
        bool starts;
    };
    std::vector<Event> events;
    std::vector<std::uint32_t> colours;
    for (int i = 0; i < static_cast<int>(segments.size()); ++i) {
        const CSimColorSegment& s = segments[i];
        colours.push_back(colourOf(s.BlockIdentifier()));
        if (s.Length() <= 0)
            continue;
        events.push_back({s.Start(), i, true});
        events.push_back({s.Start() + s.Length(), i, false});
    }
    std::sort(events.begin(), events.end(),
              [](const Event& a, const Event& b) { return a.position < b.position; });
    // Laying c over x gives (not x) xor c in the low 24 bits and c's top byte, so the colour of
    // n ranges is the xor of their low bits (inverted when n is even) under the top byte of the
    // last range in list order: kept up to date as ranges start and end.
    std::set<int> active;
    std::uint32_t lowBits = 0;
    for (std::size_t e = 0; e < events.size();) {
        const int position = events[e].position;
        for (; e < events.size() && events[e].position == position; ++e) {
            const int segment = events[e].segment;
            if (events[e].starts)
                active.insert(segment);
            else
                active.erase(segment);
            lowBits ^= colours[segment] & kLowBits;
        }
        std::uint32_t colour = kNoColour;
        if (!active.empty()) {
            const std::uint32_t inverted = active.size() % 2 == 0 ? kLowBits : 0;
            colour = ((lowBits ^ inverted) & kLowBits) | (colours[*active.rbegin()] & ~kLowBits);
        }
        m_starts.push_back(position);
        m_colours.push_back(colour);
    }
}

std::uint32_t CColourRuns::ColourAt(int position) const {
    // Ranges hold no position before the first residue, wherever they start.
    if (position < 0)
        return kNoColour;
    auto it = std::upper_bound(m_starts.begin(), m_starts.end(), position);
    if (it == m_starts.begin())
        return kNoColour;
    return m_colours[static_cast<std::size_t>(it - m_starts.begin()) - 1];
}

bool CColourRuns::IsBoundary(int position) const {
    return std::binary_search(m_starts.begin(), m_starts.end(), position);
}
