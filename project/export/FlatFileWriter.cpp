#include "export/FlatFileWriter.h"

#include "export/TextWrap.h"
#include "import/SeqText.h"

namespace {

constexpr std::size_t kLineWidth = 79;
constexpr std::size_t kFeatureColumn = 21;

std::string QualifierText(const CSxQualifier& qualifier) {
    std::string text = "/" + qualifier.name;
    if (!qualifier.hasValue)
        return text;
    text += '=';
    if (!qualifier.quoted)
        return text + qualifier.value;
    text += '"';
    for (char c : qualifier.value) {
        text += c;
        if (c == '"')
            text += '"';
    }
    return text + '"';
}

}  // namespace

std::string CFlatFileWriter::Padded(const std::string& keyword) const {
    return keyword.size() >= m_column ? keyword + " "
                                      : keyword + std::string(m_column - keyword.size(), ' ');
}

void CFlatFileWriter::Line(const std::string& text) {
    m_out += TrimRight(text);
    m_out += '\n';
}

void CFlatFileWriter::Lines(const std::string& first, const std::string& next,
                            const std::vector<std::string>& lines) {
    for (std::size_t i = 0; i < lines.size(); ++i) {
        Line((i == 0 ? Padded(first) : Padded(next)) + lines[i]);
    }
}

void CFlatFileWriter::Filled(const std::string& keyword, const std::string& continuation,
                             const std::string& text, bool always) {
    std::vector<std::string> lines = WrapWords(text, kLineWidth - m_column);
    if (lines.empty() && always)
        lines.push_back("");
    Lines(keyword, continuation, lines);
}

void CFlatFileWriter::Features(const std::string& prefix, const std::vector<CSxFeature>& features) {
    std::string indent = prefix + std::string(kFeatureColumn - prefix.size(), ' ');
    std::size_t width = kLineWidth - kFeatureColumn;
    for (const CSxFeature& feature : features) {
        std::string head = prefix + feature.key;
        head += head.size() < kFeatureColumn ? std::string(kFeatureColumn - head.size(), ' ')
                                             : std::string(" ");
        std::vector<std::string> location = WrapAfter(feature.location, ',', width);
        if (location.empty())
            location.push_back("");
        for (std::size_t i = 0; i < location.size(); ++i) {
            Line((i == 0 ? head : indent) + location[i]);
        }
        for (const CSxQualifier& qualifier : feature.qualifiers) {
            std::string text = QualifierText(qualifier);
            bool unspaced = qualifier.name == "translation";
            for (const std::string& line :
                 unspaced ? WrapHard(text, width) : WrapWords(text, width)) {
                Line(indent + line);
            }
        }
    }
}

std::vector<std::string> SequenceBlocks(const std::string& sequence) {
    std::vector<std::string> lines;
    for (std::size_t pos = 0; pos < sequence.size(); pos += 60) {
        std::string line;
        for (std::size_t block = pos; block < std::min(pos + 60, sequence.size()); block += 10) {
            if (!line.empty())
                line += ' ';
            line += sequence.substr(block, 10);
        }
        lines.push_back(line);
    }
    return lines;
}
