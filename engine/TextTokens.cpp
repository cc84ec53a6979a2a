#include "TextTokens.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace {
constexpr std::size_t kCommentPiece = 70;

bool IsSeparator(char c) {
    return c == ' ' || c == ',' || c == '\t';
}

// Drops a leading "+", which the classic conversions accept and from_chars does not ("+-1"
// stays as it is, and is no number).
std::string_view WithoutPlus(std::string_view token) {
    if (token.size() > 1 && token[0] == '+' && token[1] != '-')
        token.remove_prefix(1);
    return token;
}
}  // namespace

std::vector<std::string_view> SplitTokens(std::string_view line) {
    std::vector<std::string_view> tokens;
    std::size_t pos = 0;
    while (pos < line.size()) {
        while (pos < line.size() && IsSeparator(line[pos]))
            ++pos;
        const std::size_t start = pos;
        while (pos < line.size() && !IsSeparator(line[pos]))
            ++pos;
        if (pos > start)
            tokens.push_back(line.substr(start, pos - start));
    }
    return tokens;
}

std::vector<CTextLine> DataLines(std::string_view text) {
    std::vector<CTextLine> lines;
    int number = 0;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find_first_of("\r\n"), text.size());
        const std::string_view line = text.substr(0, end);
        std::size_t next = end + 1;
        if (end + 1 < text.size() && text[end] == '\r' && text[end + 1] == '\n')
            ++next;
        text.remove_prefix(std::min(next, text.size()));
        ++number;
        if (!line.empty() && line.find('#') == std::string_view::npos)
            lines.push_back({number, line});
    }
    return lines;
}

NumberParse ParseInteger(std::string_view token, std::int32_t& value) {
    token = WithoutPlus(token);
    const auto result = std::from_chars(token.data(), token.data() + token.size(), value);
    if (result.ec == std::errc::result_out_of_range)
        return NumberParse::outOfRange;
    if (result.ec != std::errc() || result.ptr != token.data() + token.size())
        return NumberParse::notANumber;
    return NumberParse::ok;
}

bool ParseNumber(std::string_view token, double& value) {
    token = WithoutPlus(token);
    const auto result = std::from_chars(token.data(), token.data() + token.size(), value);
    return result.ec == std::errc() && result.ptr == token.data() + token.size() &&
           std::isfinite(value);
}

std::string FixedNumber(double value, int decimals) {
    char text[400];  // room for the largest double in fixed notation
    const auto result =
        std::to_chars(text, text + sizeof text, value, std::chars_format::fixed, decimals);
    return std::string(text, result.ptr);
}

void AppendCommentLine(std::string& out, std::string_view text) {
    out += "#  ";
    for (char c : text)
        out += (c == '\n' || c == '\r') ? ' ' : c;
    out += "\n";
}

void AppendCommentLines(std::string& out, std::string_view text) {
    for (std::size_t start = 0; start < text.size(); start += kCommentPiece) {
        AppendCommentLine(out, text.substr(start, kCommentPiece));
    }
}
