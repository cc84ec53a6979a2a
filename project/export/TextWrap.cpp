#include "export/TextWrap.h"

#include "import/SeqText.h"

namespace {

// Joins pieces greedily into lines of at most `width`, with `glue` between pieces.
std::vector<std::string> Fill(const std::vector<std::string>& pieces, const std::string& glue,
                              std::size_t width) {
    std::vector<std::string> lines;
    std::string line;
    for (const std::string& piece : pieces) {
        if (!line.empty() && line.size() + glue.size() + piece.size() > width) {
            lines.push_back(line);
            line.clear();
        }
        if (!line.empty())
            line += glue;
        line += piece;
    }
    if (!line.empty())
        lines.push_back(line);
    return lines;
}

}  // namespace

std::vector<std::string> WrapWords(const std::string& text, std::size_t width) {
    return Fill(SplitTokens(text), " ", width);
}

std::vector<std::string> WrapAfter(const std::string& text, char separator, std::size_t width) {
    std::vector<std::string> pieces;
    std::size_t start = 0;
    while (start < text.size()) {
        std::size_t end = text.find(separator, start);
        end = end == std::string::npos ? text.size() : end + 1;
        pieces.push_back(text.substr(start, end - start));
        start = end;
    }
    return Fill(pieces, "", width);
}

std::vector<std::string> WrapHard(const std::string& text, std::size_t width) {
    std::vector<std::string> lines;
    for (std::size_t pos = 0; pos < text.size(); pos += width) {
        lines.push_back(text.substr(pos, width));
    }
    return lines;
}
