#include "SimBlock.h"

#include <algorithm>
#include <atomic>

#include "ScoreMatrix.h"
#include "SimBlockSet.h"
#include "SxMolEntry.h"
#include "search/MatrixAdapter.h"

namespace {

// Identifiers handed out so far; raised past every identifier read from a file.
std::atomic<std::int32_t> g_lastIdentifier{0};

std::int32_t NewIdentifier() {
    return g_lastIdentifier.fetch_add(1) + 1;
}

}  // namespace

CSimBlock::CSimBlock() : m_identifier(NewIdentifier()) {}

void CSimBlock::TakeNewIdentifier() {
    m_identifier = NewIdentifier();
}

void CSimBlock::ReserveIdentifier(int identifier) {
    std::int32_t last = g_lastIdentifier.load();
    while (last < identifier && !g_lastIdentifier.compare_exchange_weak(last, identifier)) {
    }
}

void CSimBlock::Init(std::span<const std::int32_t> members, std::span<const std::int32_t> starts,
                     int width, int score, int flag) {
    Init(std::vector<std::int32_t>(members.begin(), members.end()),
         std::vector<std::int32_t>(starts.begin(), starts.begin() + members.size()), width, score,
         flag);
}

void CSimBlock::Init(std::vector<std::int32_t>&& members, std::vector<std::int32_t>&& starts,
                     int width, int score, int flag) {
    m_width[kOriginal] = width;
    m_score[kOriginal] = score;
    starts.resize(members.size());
    static_cast<std::vector<std::int32_t>&>(m_members) = std::move(members);
    static_cast<std::vector<std::int32_t>&>(m_originalStarts) = std::move(starts);
    m_flag = flag;
    ResetCurrentLayout();
}

void CSimBlock::ResetCurrentLayout() {
    m_currentStarts = m_originalStarts;
    m_included.assign(m_members.size(), 1);
    m_width[kCurrent] = m_width[kOriginal];
    m_score[kCurrent] = m_score[kOriginal];
}

int CSimBlock::Start(Layout layout, int index) const {
    return layout == kOriginal ? m_originalStarts[index] : m_currentStarts[index];
}

void CSimBlock::ShiftMembersAbove(int removedIndex) {
    for (auto& member : m_members) {
        if (member > removedIndex)
            --member;
    }
}

bool CSimBlock::InLayout(Layout layout, int index) const {
    return layout == kOriginal || m_included[index] != 0;
}

int CSimBlock::SequenceCount(Layout layout) const {
    if (layout == kOriginal)
        return MemberCount();
    return static_cast<int>(
        std::count_if(m_included.begin(), m_included.end(), [](auto flag) { return flag != 0; }));
}

int CSimBlock::HighestStart(Layout layout) const {
    int highest = 0;
    bool any = false;
    for (int i = 0; i < MemberCount(); ++i) {
        if (!InLayout(layout, i))
            continue;
        highest = any ? std::max(highest, Start(layout, i)) : Start(layout, i);
        any = true;
    }
    return highest;
}

int CSimBlock::LowestStart(Layout layout) const {
    int lowest = -1;
    for (int i = 0; i < MemberCount(); ++i) {
        if (!InLayout(layout, i))
            continue;
        lowest = lowest < 0 ? Start(layout, i) : std::min(lowest, Start(layout, i));
    }
    return lowest;
}

double CSimBlock::MeanPairScore(Layout layout) const {
    double n = SequenceCount(layout);
    if (n <= 1)
        return 0.0;
    return m_score[layout] / (n * (n - 1) / 2);
}

int CSimBlock::LayoutScore(Layout layout, const CSxMolEntrySerialList& molecules,
                           const CScoreMatrix& matrix, int shift) const {
    std::vector<const std::string*> sequences;
    for (const auto& entry : molecules.items)
        sequences.push_back(&entry->Sequence());
    return LayoutScoreOfSequences(layout, sequences, matrix, shift);
}

int CSimBlock::LayoutScore(Layout layout, const std::vector<CSxMolEntry>& molecules,
                           const CScoreMatrix& matrix, int shift) const {
    std::vector<const std::string*> sequences;
    for (const auto& entry : molecules)
        sequences.push_back(&entry.Sequence());
    return LayoutScoreOfSequences(layout, sequences, matrix, shift);
}

int CSimBlock::LayoutScoreOfSequences(Layout layout,
                                      const std::vector<const std::string*>& sequences,
                                      const CScoreMatrix& matrix, int shift) const {
    std::vector<std::vector<std::uint8_t>> encoded;
    for (const std::string* text : sequences) {
        std::vector<std::uint8_t> codes;
        if (matrix.Encode(*text, codes))
            encoded.push_back(std::move(codes));
    }
    const CScoreGrid grid = GridOf(matrix);
    // The residue of member i at column c, or 0 when there is none (adds nothing).
    auto residue = [&](int i, long c) -> std::uint8_t {
        const int molecule = m_members[i];
        if (molecule < 0 || molecule >= static_cast<int>(encoded.size()))
            return 0;
        const auto& codes = encoded[molecule];
        const long position = static_cast<long>(Start(layout, i)) + shift + c;
        if (position < 0 || position >= static_cast<long>(codes.size()))
            return 0;
        return codes[position];
    };
    // Only columns where some member has a residue can add anything (a stored width may be
    // far larger than any sequence).
    long firstColumn = m_width[layout];
    long endColumn = 0;
    for (int u = 0; u < MemberCount(); ++u) {
        const int molecule = m_members[u];
        if (!InLayout(layout, u) || molecule < 0 || molecule >= static_cast<int>(encoded.size()))
            continue;
        const long offset = static_cast<long>(Start(layout, u)) + shift;
        firstColumn = std::min(firstColumn, std::max(0L, -offset));
        endColumn = std::max(
            endColumn,
            std::min<long>(m_width[layout], static_cast<long>(encoded[molecule].size()) - offset));
    }
    long score = 0;
    for (long c = firstColumn; c < endColumn; ++c) {
        for (int u = 0; u < MemberCount(); ++u) {
            if (!InLayout(layout, u))
                continue;
            const std::uint8_t a = residue(u, c);
            if (a == 0)
                continue;
            for (int v = u + 1; v < MemberCount(); ++v) {
                if (!InLayout(layout, v))
                    continue;
                const std::uint8_t b = residue(v, c);
                if (b != 0)
                    score += grid(a, b);
            }
        }
    }
    return static_cast<int>(score);
}

bool CSimBlock::IsUnedited() const {
    if (m_width[kOriginal] != m_width[kCurrent] || m_score[kOriginal] != m_score[kCurrent]) {
        return false;
    }
    if (m_originalStarts != m_currentStarts)
        return false;
    return std::all_of(m_included.begin(), m_included.end(), [](auto flag) { return flag != 0; });
}

bool CSimBlock::operator==(const CSimBlock& other) const {
    return m_identifier == other.m_identifier && m_flag == other.m_flag && m_name == other.m_name &&
           m_colour == other.m_colour &&
           std::equal(std::begin(m_reserved), std::end(m_reserved), other.m_reserved) &&
           std::equal(std::begin(m_width), std::end(m_width), other.m_width) &&
           std::equal(std::begin(m_score), std::end(m_score), other.m_score) &&
           m_members == other.m_members && m_originalStarts == other.m_originalStarts &&
           m_currentStarts == other.m_currentStarts && m_included == other.m_included;
}

std::int64_t CSimBlock::OrderKey() const {
    // The count above, the score (shifted to be non-negative) in the lower 32 bits.
    const auto count = static_cast<std::int16_t>(MemberCount());
    const std::int64_t score = std::int64_t{m_score[kOriginal]} - INT32_MIN;
    return (std::int64_t{count} << 32) + score;
}

void CSimBlock::Serialize(CArchive& ar) {
    ar.XMember(m_identifier);
    ar.XMember(m_name);
    ar.XMember(m_colour);
    for (int layout : {kOriginal, kCurrent}) {
        ar.XMember(m_reserved[layout]);
        ar.XMember(m_width[layout]);
        ar.XMember(m_score[layout]);
    }
    ar.XMember(m_flag);
    ar.XData(m_members);
    ar.XData(m_originalStarts);
    ar.XData(m_currentStarts);
    ar.XData(m_included);
    if (ar.IsLoading()) {
        const std::size_t count = m_members.size();
        if (m_originalStarts.size() != count || m_currentStarts.size() != count ||
            m_included.size() != count) {
            throw CArchiveException(CArchiveException::genericError,
                                    "block arrays of different sizes");
        }
        ReserveIdentifier(m_identifier);
    }
}

TB_REGISTER_CLASS(CSimBlock);
