#include "TextTokens.h"

#include <charconv>

namespace {
constexpr std::size_t kCommentPiece = 70;

bool IsSeparator(char c) {
    return c == ' ' || c == ',' || c == '\t';
}

// Drops a leading "+", which the classic conversions accept and from_chars does not.
std::string_view WithoutPlus(std::string_view token) {
    if (!token.empty() && token.front() == '+')
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

std::optional<std::int32_t> LeadingInteger(std::string_view token) {
    token = WithoutPlus(token);
    std::int32_t value = 0;
    const auto result = std::from_chars(token.data(), token.data() + token.size(), value);
    if (result.ec == std::errc::result_out_of_range)
        return std::nullopt;
    return result.ec == std::errc() ? value : 0;
}

double LeadingNumber(std::string_view token) {
    token = WithoutPlus(token);
    double value = 0.0;
    const auto result = std::from_chars(token.data(), token.data() + token.size(), value);
    return result.ec == std::errc() ? value : 0.0;
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
