#include "import/Recognise.h"

#include "UserPrompt.h"
#include "import/SeqText.h"

namespace {

constexpr std::string_view kNucleotideTestSet = "nagctu";
constexpr std::string_view kAminoAcidTestSet = "xflsy*cwphqrimtnkvadeg";

struct CSuiteMarker {
    const char* text;
    int type;
};
constexpr CSuiteMarker kSuiteMarkers[] = {
    {"@552656AS34@", kTypeProtein},
    {"@752656AS34@", kTypeProtein},
    {"@551656AS34@", kTypeNucleic},
    {"@751656AS34@", kTypeNucleic},
};

std::string_view WithoutTrailingPunctuation(std::string_view word) {
    while (!word.empty() && (word.back() == ';' || word.back() == '.' || word.back() == ',')) {
        word.remove_suffix(1);
    }
    return word;
}

// The type the header words after the keyword and the name give, or 0.
int TypeOfHeaderLine(const std::string& line) {
    std::vector<std::string> tokens = SplitTokens(line);
    for (std::size_t i = 2; i < tokens.size(); ++i) {
        if (int type = TypeOfHeaderWord(tokens[i]))
            return type;
    }
    return kTypeUnknown;
}

bool ContainsAny(const std::string& line, const std::vector<std::string>& markers) {
    for (const std::string& marker : markers) {
        if (Contains(line, marker))
            return true;
    }
    return false;
}

// Reads on to the start of the sequence and lets the content test decide.
int TypeFromSequenceSection(CSxStream& stream) {
    std::string line;
    while (stream.ReadLine(line)) {
        bool gcgHeader =
            Contains(line, "Length") && Contains(line, "Check") && Contains(line, "Type");
        if (Contains(line, "ORIGIN") || Contains(line, "SQ   ") || gcgHeader) {
            return TypeByContent(stream, {"LOCUS", "ID   ", "//"});
        }
    }
    return kTypeUnknown;
}

}  // namespace

int TypeOfHeaderWord(std::string_view word) {
    std::string lower = ToLower(WithoutTrailingPunctuation(word));
    if (lower == "aa" || lower == "prt")
        return kTypeProtein;
    if (Contains(word, "RNA") || Contains(word, "DNA") || lower == "circular" || lower == "bp") {
        return kTypeNucleic;
    }
    return kTypeUnknown;
}

bool IsCircularWord(std::string_view word) {
    return ToLower(WithoutTrailingPunctuation(word)) == "circular";
}

int TypeByContent(CSxStream& stream, const std::vector<std::string>& stopMarkers) {
    int type = kTypeUnknown;
    std::string line;
    while (stream.ReadLine(line) && !ContainsAny(line, stopMarkers)) {
        if (Contains(line, "Length") || Contains(line, "Check") || Contains(line, "Type")) {
            continue;
        }
        for (const std::string& token : SplitTokens(line)) {
            if (StartsWithNonZeroNumber(token))
                continue;
            std::string lower = ToLower(token);
            bool uracilAndThymine = Contains(lower, "u") && Contains(lower, "t");
            if (!uracilAndThymine && ConsistsOf(lower, kNucleotideTestSet)) {
                if (type != kTypeProtein)
                    type = kTypeNucleic;
            } else if (ConsistsOf(lower, kAminoAcidTestSet)) {
                type = kTypeProtein;
            }
        }
    }
    return type;
}

CRecognition Recognise(CSxStream& stream) {
    CRecognition result;
    std::string line;
    while (stream.ReadLine(line)) {
        for (const CSuiteMarker& marker : kSuiteMarkers) {
            if (Contains(line, marker.text)) {
                return {marker.type, kFormatSuite, true};
            }
        }
        if (!line.empty() && line[0] == '>') {
            // The first record with residues decides; records without any are passed over.
            result.format = kFormatFasta;
            while (result.type == kTypeUnknown && !stream.AtEnd())
                result.type = TypeByContent(stream, {"//", ">"});
            return result;
        }
        if (Contains(line, "ID   ")) {
            result.format = kFormatEmbl;
        } else if (Contains(line, "LOCUS")) {
            result.format = kFormatGenBank;
        } else {
            continue;
        }
        result.type = TypeOfHeaderLine(line);
        if (result.type == kTypeUnknown)
            result.type = TypeFromSequenceSection(stream);
        return result;
    }
    return result;
}
