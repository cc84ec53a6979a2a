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
        if (chunk.size() >= kChunkBytes) {
            out.write(chunk.data(), static_cast<std::streamsize>(chunk.size()));
            chunk.clear();
        }
    }
    out.write(chunk.data(), static_cast<std::streamsize>(chunk.size()));
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
