#pragma once
// Small text helpers shared by recognition, the readers and the writers.

#include <string>
#include <string_view>
#include <vector>

// Splits at blanks, form feeds, CRs and LFs (tabs stay inside tokens).
std::vector<std::string> SplitTokens(std::string_view line);
// The integer value the text starts with, as atoi reads it; only whether it is zero matters to
// callers, so large values are not exact.
bool StartsWithNonZeroNumber(std::string_view text);
// Appends the residues of a sequence line, lower-cased: blanks, tabs, line ends and digits
// (position numbers) are left out, every other character is kept.
void AppendResidues(std::string& sequence, std::string_view line);
// Only blanks, tabs, form feeds, CRs and LFs (or nothing).
bool IsBlankLine(std::string_view line);
std::string ToLower(std::string_view text);
std::string ToUpper(std::string_view text);
std::string Trim(std::string_view text);
std::string TrimRight(std::string_view text);
bool Contains(std::string_view text, std::string_view part);
bool StartsWith(std::string_view text, std::string_view prefix);
// Every character of `text` occurs in `alphabet`.
bool ConsistsOf(std::string_view text, std::string_view alphabet);
// Splits at `separator`, trims each piece and drops empty pieces.
std::vector<std::string> SplitList(std::string_view text, char separator);
// Removes one trailing `c` (after trimming).
std::string StripTrailing(std::string_view text, char c);
