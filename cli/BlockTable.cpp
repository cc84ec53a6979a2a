#include "BlockTable.h"

#include <cstdio>

#include "BlockSignificance.h"
#include "ScoreMatrix.h"
#include "SimBlockSet.h"

const char* const kBlockTableHeader =
    "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers";

namespace {

constexpr CSimBlock::Layout kShown = CSimBlock::kCurrent;

std::string Printf(const char* format, double value) {
    char text[64];
    std::snprintf(text, sizeof text, format, value);
    return text;
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

// The included members in member order: entry name and 1-based current start.
std::vector<std::pair<std::string, int>> ShownMembers(const CSimBlockSet& set,
                                                      const CSimBlock& block) {
    std::vector<std::pair<std::string, int>> members;
    for (int i = 0; i < block.MemberCount(); ++i) {
        if (!block.IsIncluded(i))
            continue;
        const CSxMolEntry* entry = set.MoleculeAt(block.Member(i));
        members.emplace_back(entry ? entry->Name() : "?", block.Start(kShown, i) + 1);
    }
    return members;
}

}  // namespace

std::string BlockTableRow(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                          double expectationLimit) {
    const CSimBlock& block = *set.BlockAt(index);
    const CBlockSignificance significance =
        EvaluateBlockSignificance(block, &set, matrix, expectationLimit, kShown);
    std::string members;
    for (const auto& [name, start] : ShownMembers(set, block)) {
        members += (members.empty() ? "" : ",") + name + ":" + std::to_string(start);
    }
    return std::to_string(index + 1) + "\t" + block.Name() + "\t" +
           std::to_string(block.SequenceCount(kShown)) + "\t" +
           std::to_string(block.Width(kShown)) + "\t" +
           Printf("%.1f", block.MeanPairScore(kShown)) + "\t" +
           std::to_string(block.Score(kShown)) + "\t" + SignificanceWord(significance.state) +
           "\t" + Printf("%.3e", significance.p) + "\t" +
           std::to_string(block.LowestStart(kShown) + 1) + "\t" + members;
}

nlohmann::json BlockJson(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                         double expectationLimit) {
    const CSimBlock& block = *set.BlockAt(index);
    const CBlockSignificance significance =
        EvaluateBlockSignificance(block, &set, matrix, expectationLimit, kShown);
    nlohmann::json members = nlohmann::json::array();
    for (const auto& [name, start] : ShownMembers(set, block)) {
        members.push_back({{"name", name}, {"start", start}});
    }
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
