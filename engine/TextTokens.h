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

// The integer at the start of `token` ("12abc" -> 12, "x" -> 0), as the classic C conversion
// reads it; none when the number does not fit 32 bits.
std::optional<std::int32_t> LeadingInteger(std::string_view token);
// The decimal number at the start of `token` ("0.25x" -> 0.25, "x" -> 0).
double LeadingNumber(std::string_view token);
// `value` with exactly `decimals` digits after the point.
std::string FixedNumber(double value, int decimals);

// Appends "#  " + text + "\n", line breaks inside the text turned into blanks so that a
// comment can never turn into data lines.
void AppendCommentLine(std::string& out, std::string_view text);
// Appends `text` as comment lines "#  " + piece + "\n", cut into pieces of 70 characters.
void AppendCommentLines(std::string& out, std::string_view text);
