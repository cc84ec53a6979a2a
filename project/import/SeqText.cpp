#include "import/SeqText.h"

#include <algorithm>
#include <cctype>

namespace {
constexpr std::string_view kDelimiters = " \f\r\n";
constexpr std::string_view kWhitespace = " \t\f\r\n\v";
}  // namespace

std::vector<std::string> SplitTokens(std::string_view line) {
    std::vector<std::string> tokens;
    std::size_t pos = 0;
    while ((pos = line.find_first_not_of(kDelimiters, pos)) != std::string_view::npos) {
        std::size_t end = line.find_first_of(kDelimiters, pos);
        if (end == std::string_view::npos)
            end = line.size();
        tokens.emplace_back(line.substr(pos, end - pos));
        pos = end;
    }
    return tokens;
}

bool StartsWithNonZeroNumber(std::string_view text) {
    std::size_t i = 0;
    if (i < text.size() && (text[i] == '+' || text[i] == '-'))
        ++i;
    for (; i < text.size() && std::isdigit(static_cast<unsigned char>(text[i])); ++i) {
        if (text[i] != '0')
            return true;
    }
    return false;
}

void AppendResidues(std::string& sequence, std::string_view line) {
    for (char c : line) {
        const auto byte = static_cast<unsigned char>(c);
        if (kWhitespace.find(c) == std::string_view::npos && !std::isdigit(byte))
            sequence += static_cast<char>(std::tolower(byte));
    }
}

bool IsBlankLine(std::string_view line) {
    return line.find_first_not_of(kWhitespace) == std::string_view::npos;
}

std::string ToLower(std::string_view text) {
    std::string result(text);
    for (char& c : result)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return result;
}

std::string ToUpper(std::string_view text) {
    std::string result(text);
    for (char& c : result)
        c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return result;
}

std::string TrimRight(std::string_view text) {
    std::size_t end = text.find_last_not_of(kWhitespace);
    return end == std::string_view::npos ? std::string() : std::string(text.substr(0, end + 1));
}

std::string Trim(std::string_view text) {
    std::size_t start = text.find_first_not_of(kWhitespace);
    return start == std::string_view::npos ? std::string() : TrimRight(text.substr(start));
}

bool Contains(std::string_view text, std::string_view part) {
    return text.find(part) != std::string_view::npos;
}

bool StartsWith(std::string_view text, std::string_view prefix) {
    return text.substr(0, prefix.size()) == prefix;
}

bool ConsistsOf(std::string_view text, std::string_view alphabet) {
    return std::all_of(text.begin(), text.end(),
                       [&](char c) { return alphabet.find(c) != std::string_view::npos; });
}

std::vector<std::string> SplitList(std::string_view text, char separator) {
    std::vector<std::string> pieces;
    std::size_t pos = 0;
    while (pos <= text.size()) {
        std::size_t end = text.find(separator, pos);
        if (end == std::string_view::npos)
            end = text.size();
        std::string piece = Trim(text.substr(pos, end - pos));
        if (!piece.empty())
            pieces.push_back(std::move(piece));
        pos = end + 1;
    }
    return pieces;
}

std::string StripTrailing(std::string_view text, char c) {
    std::string result = Trim(text);
    if (!result.empty() && result.back() == c)
        result.pop_back();
    return TrimRight(result);
}
