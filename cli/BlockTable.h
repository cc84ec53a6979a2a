#pragma once
// The block table of the command-line tool: one row per block of a set, in block-set order,
// describing each block's current layout.

#include <nlohmann/json.hpp>
#include <string>

class CScoreMatrix;
class CSimBlockSet;

// "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers"
extern const char* const kBlockTableHeader;

// The row of block `index` (0-based): 1-based index, name, included members, width, MP-score,
// SP-score, significance ("yes", "no", "n/a") and P under `matrix` and `expectationLimit`,
// lowest start + 1, and the included members as NAME:START (1-based) joined by commas.
std::string BlockTableRow(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                          double expectationLimit);

// The same values as a JSON object (members as a list of {"name", "start"}).
nlohmann::json BlockJson(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                         double expectationLimit);
