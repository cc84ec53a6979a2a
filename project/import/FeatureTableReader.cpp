#include "import/FeatureTableReader.h"

#include <algorithm>

#include "import/SeqText.h"

namespace {

// Keys start at column 6; anything indented further continues the feature.
constexpr std::size_t kMaxKeyIndent = 15;

bool IsPositionToken(std::string_view token) {
    if (!token.empty() && (token[0] == '<' || token[0] == '>' || token[0] == '?')) {
        token.remove_prefix(1);
    }
    return !token.empty() &&
           std::all_of(token.begin(), token.end(), [](char c) { return c >= '0' && c <= '9'; });
}

// "/name=\"va\"\"lue\"" -> name, value with doubled quotes undone.
CSxQualifier ParseQualifier(const std::string& raw) {
    CSxQualifier qualifier;
    std::string_view text(raw);
    text.remove_prefix(1);  // '/'
    std::size_t equals = text.find('=');
    qualifier.name = Trim(text.substr(0, equals));
    if (equals == std::string_view::npos) {
        qualifier.hasValue = false;
        qualifier.quoted = false;
        return qualifier;
    }
    std::string value = Trim(text.substr(equals + 1));
    qualifier.quoted = !value.empty() && value.front() == '"';
    if (qualifier.quoted) {
        value.erase(0, 1);
        if (!value.empty() && value.back() == '"')
            value.pop_back();
        std::string unescaped;
        for (std::size_t i = 0; i < value.size(); ++i) {
            unescaped += value[i];
            if (value[i] == '"' && i + 1 < value.size() && value[i + 1] == '"')
                ++i;
        }
        value = std::move(unescaped);
    }
    qualifier.value = std::move(value);
    return qualifier;
}

}  // namespace

bool CFeatureTableReader::QualifierOpen() const {
    // An odd number of quotes: a quoted value goes on in the next line.
    return m_inQualifier && !m_oldStyleNote &&
           std::count(m_qualifier.begin(), m_qualifier.end(), '"') % 2 == 1;
}

void CFeatureTableReader::CloseQualifier() {
    if (m_oldStyleNote)
        m_qualifier += '"';
    if (m_inQualifier && !m_features.empty()) {
        m_features.back().qualifiers.push_back(ParseQualifier(m_qualifier));
    }
    m_inQualifier = false;
    m_oldStyleNote = false;
    m_qualifier.clear();
}

void CFeatureTableReader::AppendOldStyleNote(std::string_view text) {
    for (char c : text) {
        m_qualifier += c;
        if (c == '"')
            m_qualifier += '"';
    }
}

void CFeatureTableReader::StartFeature(std::string_view key, std::string_view rest) {
    CloseQualifier();
    if (!m_features.empty())
        m_features.back().SetLocation(m_location);
    m_features.emplace_back();
    m_features.back().key = std::string(key);
    m_location.clear();
    std::vector<std::string> tokens = SplitTokens(rest);
    if (tokens.size() >= 2 && IsPositionToken(tokens[0]) && IsPositionToken(tokens[1])) {
        // Older SWISS-PROT layout: from, to, then a description.
        m_location = tokens[0] + ".." + tokens[1];
        std::size_t afterTo = rest.find(tokens[1], rest.find(tokens[0]) + tokens[0].size());
        std::string description = Trim(rest.substr(afterTo + tokens[1].size()));
        if (!description.empty()) {
            m_qualifier = "/note=\"";
            AppendOldStyleNote(description);
            m_inQualifier = true;
            m_oldStyleNote = true;
        }
        return;
    }
    m_location = Trim(rest);
}

void CFeatureTableReader::AddLine(std::string_view line) {
    std::size_t indent = line.find_first_not_of(' ');
    if (indent == std::string_view::npos)
        return;
    std::string text = Trim(line);
    if (indent <= kMaxKeyIndent && text[0] != '/' && !QualifierOpen()) {
        std::size_t keyEnd = text.find_first_of(" \t");
        if (keyEnd == std::string::npos)
            keyEnd = text.size();
        StartFeature(std::string_view(text).substr(0, keyEnd),
                     std::string_view(text).substr(keyEnd));
        return;
    }
    if (m_features.empty())
        return;
    if (text[0] == '/' && !QualifierOpen()) {
        CloseQualifier();
        m_qualifier = text;
        m_inQualifier = true;
    } else if (m_oldStyleNote) {
        m_qualifier += ' ';
        AppendOldStyleNote(text);
    } else if (m_inQualifier) {
        // Protein translations are wrapped without blanks; other texts at blanks.
        bool unspaced = StartsWith(m_qualifier, "/translation=");
        m_qualifier += unspaced ? "" : " ";
        m_qualifier += text;
    } else {
        m_location += text;  // locations are wrapped after commas, without blanks
    }
}

std::vector<CSxFeature> CFeatureTableReader::Finish() {
    CloseQualifier();
    if (!m_features.empty())
        m_features.back().SetLocation(m_location);
    m_location.clear();
    return std::move(m_features);
}
