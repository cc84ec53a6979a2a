#pragma once
// Small text helpers shared by the matrix file reader and writer. Numbers are read and written
// independently of the C locale, so files look the same whatever the user's language.

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// The tokens of `line` between blanks, commas and tabs (empty tokens dropped).
std::vector<std::string_view> SplitTokens(std::string_view line);

// One line of a text file with its number (the first line is 1), without its line end.
struct CTextLine {
    int number;
    std::string_view text;
};
// The lines that carry data: empty lines and lines holding a "#" anywhere are left out. LF,
// CR LF and CR each end a line.
std::vector<CTextLine> DataLines(std::string_view text);

enum class NumberParse { ok, notANumber, outOfRange };
// The whole of `token` as a 32-bit integer: an optional sign, then decimal digits only.
NumberParse ParseInteger(std::string_view token, std::int32_t& value);
// The whole of `token` as a finite decimal number ("0.25", "-1", "2e-3"); false for
// anything else.
bool ParseNumber(std::string_view token, double& value);
// `value` with exactly `decimals` digits after the point.
std::string FixedNumber(double value, int decimals);

// Appends "#  " + text + "\n", line breaks inside the text turned into blanks so that a
// comment can never turn into data lines.
void AppendCommentLine(std::string& out, std::string_view text);
// Appends `text` as comment lines "#  " + piece + "\n", cut into pieces of 70 characters.
void AppendCommentLines(std::string& out, std::string_view text);
