#pragma once
// The block table of the command-line tool: one row per block of a set, in block-set order,
// describing each block's current layout.

#include <iosfwd>
#include <nlohmann/json.hpp>
#include <string>

class CScoreMatrix;
class CSimBlockSet;

// "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers"
extern const char* const kBlockTableHeader;

// Appends the row of block `index` (0-based), without a line end: 1-based index, name, included
// members, width, MP-score, SP-score, significance ("yes", "no", "n/a") and P under `matrix` and
// `expectationLimit`, lowest start + 1, and the included members as NAME:START (1-based) joined
// by commas.
void AppendBlockTableRow(std::string& text, const CSimBlockSet& set, int index,
                         const CScoreMatrix& matrix, double expectationLimit);

// The same row as a string of its own.
std::string BlockTableRow(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                          double expectationLimit);

// The header line and one line per block, written to `out` in large chunks.
void WriteBlockTable(std::ostream& out, const CSimBlockSet& set, const CScoreMatrix& matrix,
                     double expectationLimit);

// Append `value` exactly as printf's "%.*f" and "%.*e" with `precision` (at most 60) write it.
void AppendFixed(std::string& text, double value, int precision);
void AppendScientific(std::string& text, double value, int precision);

// The same values as a JSON object (members as a list of {"name", "start"}).
nlohmann::json BlockJson(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                         double expectationLimit);

// Every block's JSON object as an array, written in large chunks with the same text that
// nlohmann::json::dump(2) gives for the array nested `depth` levels deep in a document.
void WriteBlocksJson(std::ostream& out, const CSimBlockSet& set, const CScoreMatrix& matrix,
                     double expectationLimit, int depth);
