#include "BlockTable.h"

#include <charconv>
#include <ostream>

#include "BlockSignificance.h"
#include "ScoreMatrix.h"
#include "SimBlockSet.h"

const char* const kBlockTableHeader =
    "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers";

namespace {

constexpr CSimBlock::Layout kShown = CSimBlock::kCurrent;

// The table goes out whenever this much of it has been formatted.
constexpr std::size_t kChunkBytes = 64 * 1024;

// Room for any double in fixed notation (up to 309 integer digits) with a small precision.
constexpr int kNumberChars = 400;

template <typename Number, typename... Format>
void AppendNumber(std::string& text, Number value, Format... format) {
    char digits[kNumberChars];
    const std::to_chars_result result =
        std::to_chars(digits, digits + sizeof digits, value, format...);
    text.append(digits, result.ptr);
}

const char* SignificanceWord(int state) {
    switch (state) {
        case kSignificant:
            return "yes";
        case kNotSignificant:
            return "no";
        default:
            return "n/a";
    }
}

// Calls `visit(name, start)` for the included members in member order, with the entry name and
// the 1-based current start.
template <typename Visit>
void ForEachShownMember(const CSimBlockSet& set, const CSimBlock& block, Visit visit) {
    static const std::string kUnknownName = "?";
    for (int i = 0; i < block.MemberCount(); ++i) {
        if (!block.IsIncluded(i))
            continue;
        const CSxMolEntry* entry = set.MoleculeAt(block.Member(i));
        visit(entry ? entry->Name() : kUnknownName, block.Start(kShown, i) + 1);
    }
}

// Writes `chunk` out once it has grown large enough (or always, at the end).
void FlushChunk(std::ostream& out, std::string& chunk, bool last = false) {
    if (!last && chunk.size() < kChunkBytes)
        return;
    out.write(chunk.data(), static_cast<std::streamsize>(chunk.size()));
    chunk.clear();
}

}  // namespace

void AppendFixed(std::string& text, double value, int precision) {
    AppendNumber(text, value, std::chars_format::fixed, precision);
}

void AppendScientific(std::string& text, double value, int precision) {
    AppendNumber(text, value, std::chars_format::scientific, precision);
}

void AppendBlockTableRow(std::string& text, const CSimBlockSet& set, int index,
                         const CScoreMatrix& matrix, double expectationLimit) {
    const CSimBlock& block = *set.BlockAt(index);
    const CBlockSignificance significance =
        EvaluateBlockSignificance(block, &set, matrix, expectationLimit, kShown);
    AppendNumber(text, index + 1);
    text += '\t';
    text += block.Name();
    text += '\t';
    AppendNumber(text, block.SequenceCount(kShown));
    text += '\t';
    AppendNumber(text, block.Width(kShown));
    text += '\t';
    AppendFixed(text, block.MeanPairScore(kShown), 1);
    text += '\t';
    AppendNumber(text, block.Score(kShown));
    text += '\t';
    text += SignificanceWord(significance.state);
    text += '\t';
    AppendScientific(text, significance.p, 3);
    text += '\t';
    AppendNumber(text, block.LowestStart(kShown) + 1);
    text += '\t';
    bool first = true;
    ForEachShownMember(set, block, [&](const std::string& name, int start) {
        if (!first)
            text += ',';
        first = false;
        text += name;
        text += ':';
        AppendNumber(text, start);
    });
}

std::string BlockTableRow(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                          double expectationLimit) {
    std::string row;
    AppendBlockTableRow(row, set, index, matrix, expectationLimit);
    return row;
}

void WriteBlockTable(std::ostream& out, const CSimBlockSet& set, const CScoreMatrix& matrix,
                     double expectationLimit) {
    std::string chunk;
    chunk.reserve(2 * kChunkBytes);
    chunk += kBlockTableHeader;
    chunk += '\n';
    for (int b = 0; b < set.BlockCount(); ++b) {
        AppendBlockTableRow(chunk, set, b, matrix, expectationLimit);
        chunk += '\n';
        FlushChunk(out, chunk);
    }
    FlushChunk(out, chunk, true);
}

nlohmann::json BlockJson(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                         double expectationLimit) {
    const CSimBlock& block = *set.BlockAt(index);
    const CBlockSignificance significance =
        EvaluateBlockSignificance(block, &set, matrix, expectationLimit, kShown);
    nlohmann::json members = nlohmann::json::array();
    ForEachShownMember(set, block, [&](const std::string& name, int start) {
        members.push_back({{"name", name}, {"start", start}});
    });
    return {{"block", index + 1},
            {"name", block.Name()},
            {"m", block.SequenceCount(kShown)},
            {"len", block.Width(kShown)},
            {"mp_score", block.MeanPairScore(kShown)},
            {"sp_score", block.Score(kShown)},
            {"significance", SignificanceWord(significance.state)},
            {"p", significance.p},
            {"offset", block.LowestStart(kShown) + 1},
            {"members", members}};
}

void WriteBlocksJson(std::ostream& out, const CSimBlockSet& set, const CScoreMatrix& matrix,
                     double expectationLimit, int depth) {
    constexpr int kIndent = 2;
    if (set.BlockCount() == 0) {
        out << "[]";
        return;
    }
    // Each block is built and dumped on its own (the whole document of a large search would take
    // far more memory than its text), then indented to its depth.
    const std::string outer(static_cast<std::size_t>(depth * kIndent), ' ');
    const std::string inner(outer.size() + kIndent, ' ');
    std::string chunk;
    chunk.reserve(2 * kChunkBytes);
    chunk += "[\n";
    for (int b = 0; b < set.BlockCount(); ++b) {
        if (b > 0)
            chunk += ",\n";
        chunk += inner;
        const std::string text = BlockJson(set, b, matrix, expectationLimit).dump(kIndent);
        std::size_t from = 0;
        for (std::size_t end; (end = text.find('\n', from)) != std::string::npos; from = end + 1) {
            chunk.append(text, from, end + 1 - from);
            chunk += inner;
        }
        chunk.append(text, from);
        FlushChunk(out, chunk);
    }
    chunk += '\n';
    chunk += outer;
    chunk += ']';
    FlushChunk(out, chunk, true);
}
