// GenBank and GenPept entries: LOCUS header, annotation keywords in columns 1-12 with their
// text from column 13, sub-keywords indented, the feature table, the sequence after ORIGIN and
// "//" at the end.

#include <algorithm>
#include <array>

#include "import/FeatureTableReader.h"
#include "import/HeaderWords.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/SeqText.h"
#include "import/SuiteData.h"

namespace {

constexpr std::size_t kTextColumn = 12;
constexpr std::array<std::string_view, 8> kSubKeywords = {
    "ORGANISM", "AUTHORS", "CONSRTM", "TITLE", "JOURNAL", "PUBMED", "MEDLINE", "REMARK"};

// One keyword with its text lines (the first line's text after the keyword, then the
// continuation lines whole).
struct CSection {
    std::string keyword;
    std::vector<std::string> lines;
};

std::string Joined(const CSection& section) {
    std::string text;
    for (const std::string& line : section.lines) {
        std::string part = Trim(line);
        if (part.empty())
            continue;
        if (!text.empty())
            text += ' ';
        text += part;
    }
    return text;
}

// Text of a continuation line from column 13, or trimmed when the line is indented less.
std::string ColumnText(const std::string& line) {
    if (line.size() > kTextColumn && line.find_first_not_of(' ') >= kTextColumn) {
        return TrimRight(std::string_view(line).substr(kTextColumn));
    }
    return Trim(line);
}

// The text after a keyword that starts a line: from column 13 in the usual layout.
std::string FirstLineText(const std::string& line, const std::string& keyword) {
    if (keyword.size() < kTextColumn && line.size() > kTextColumn &&
        IsBlankLine(std::string_view(line).substr(keyword.size(), kTextColumn - keyword.size()))) {
        return TrimRight(std::string_view(line).substr(kTextColumn));
    }
    return Trim(std::string_view(line).substr(keyword.size()));
}

bool IsDivision(const std::string& token) {
    return token.size() == 3 &&
           std::all_of(token.begin(), token.end(), [](char c) { return c >= 'A' && c <= 'Z'; });
}

class CGenBankParser {
  public:
    CGenBankParser(CSxMol& molecule, CSxStream& stream) : m_mol(molecule), m_stream(stream) {}
    int Read();

  private:
    int ReadLocus(const std::vector<std::string>& tokens);
    void ReadBody();
    void ReadSequence();
    void AddLine(const std::string& line);
    void Apply(const CSection& section);
    void ApplyOrganism(const CSection& section);
    void ApplyReferencePart(const CSection& section);
    CSxReference& CurrentReference();

    CSxMol& m_mol;
    CSxStream& m_stream;
    CSxDescription& m_desc = m_mol.Description();
    std::vector<CSection> m_sections;
    CFeatureTableReader m_features;
    bool m_inFeatures = false;
    std::string m_suiteData;
    bool m_hasSuiteData = false;
    std::string m_sequence;
};

int CGenBankParser::Read() {
    std::string line;
    std::vector<std::string> tokens;
    for (;;) {
        if (!m_stream.ReadLine(line))
            return kNoMoreRecords;
        tokens = SplitTokens(line);
        if (!tokens.empty() && tokens[0] == "LOCUS")
            break;
    }
    m_stream.MarkRecordStart();
    if (int result = ReadLocus(tokens))
        return result;
    ReadBody();
    for (const CSection& section : m_sections)
        Apply(section);
    m_desc.features = m_features.Finish();
    if (m_hasSuiteData && !ReadSuiteData(m_suiteData, m_mol))
        return kBadSuiteData;
    if (m_sequence.empty())
        return kNoSequence;
    m_mol.SetSequence(std::move(m_sequence));
    return kReadOne;
}

int CGenBankParser::ReadLocus(const std::vector<std::string>& tokens) {
    if (tokens.size() < 2)
        return kNoName;
    std::string name = tokens[1];
    std::replace(name.begin(), name.end(), '\\', ' ');
    m_mol.SetName(name);
    if (int result = ApplyHeaderWords(m_mol, tokens))
        return result;
    for (std::size_t i = 2; i < tokens.size(); ++i) {
        const std::string& word = tokens[i];
        if (IsDatabaseDate(word)) {
            m_desc.dbDate = word;
        } else if (IsDivision(word)) {
            m_desc.division = word;
        } else if (Contains(word, "DNA") || Contains(word, "RNA")) {
            m_desc.moleculeType = word;
        }
    }
    return 0;
}

void CGenBankParser::ReadBody() {
    std::string line;
    while (m_stream.ReadLine(line)) {
        if (StartsWith(line, "//"))
            return;
        std::vector<std::string> tokens = SplitTokens(line);
        if (!line.empty() && line[0] != ' ' && !tokens.empty()) {
            if (tokens[0] == "LOCUS") {  // a new entry without "//" before it
                m_stream.UnreadLine();
                return;
            }
            if (tokens[0] == "ORIGIN") {
                ReadSequence();
                return;
            }
        }
        AddLine(line);
    }
}

void CGenBankParser::ReadSequence() {
    std::string line;
    while (m_stream.ReadLine(line)) {
        if (Contains(line, "//"))
            return;
        if (Contains(line, "LOCUS")) {
            m_stream.UnreadLine();
            return;
        }
        AppendResidues(m_sequence, line);
    }
}

void CGenBankParser::AddLine(const std::string& line) {
    if (IsBlankLine(line)) {
        // Comments keep their empty lines; elsewhere blank lines mean nothing.
        if (!m_inFeatures && !m_sections.empty() && m_sections.back().keyword == "COMMENT") {
            m_sections.back().lines.push_back("");
        }
        return;
    }
    std::vector<std::string> tokens = SplitTokens(line);
    if (line[0] != ' ') {
        m_inFeatures = tokens[0] == "FEATURES";
        m_sections.push_back({tokens[0], {FirstLineText(line, tokens[0])}});
        return;
    }
    if (m_inFeatures) {
        m_features.AddLine(line);
        return;
    }
    std::size_t indent = line.find_first_not_of(' ');
    bool subKeyword = indent < kTextColumn && std::find(kSubKeywords.begin(), kSubKeywords.end(),
                                                        tokens[0]) != kSubKeywords.end();
    if (subKeyword) {
        std::size_t after = indent + tokens[0].size();
        m_sections.push_back({tokens[0], {Trim(std::string_view(line).substr(after))}});
    } else if (!m_sections.empty()) {
        m_sections.back().lines.push_back(ColumnText(line));
    }
}

CSxReference& CGenBankParser::CurrentReference() {
    if (m_desc.references.empty())
        m_desc.references.emplace_back();
    return m_desc.references.back();
}

void CGenBankParser::Apply(const CSection& section) {
    const std::string& key = section.keyword;
    if (key == "DEFINITION") {
        m_desc.definition = Joined(section);
    } else if (key == "ACCESSION") {
        for (const std::string& token : SplitTokens(Joined(section))) {
            m_desc.accessions.push_back(token);
        }
    } else if (key == "KEYWORDS") {
        m_desc.keywords = SplitList(StripTrailing(Joined(section), '.'), ';');
    } else if (key == "SOURCE") {
        std::string source = Joined(section);
        m_desc.sequenceSource = source == "." ? std::string() : source;
    } else if (key == "ORGANISM") {
        ApplyOrganism(section);
    } else if (key == "REFERENCE") {
        CSxReference reference;
        std::string text = Joined(section);
        std::size_t numberEnd = text.find(' ');
        reference.number = StartsWithNonZeroNumber(text) ? std::atoi(text.c_str()) : 0;
        if (numberEnd != std::string::npos)
            reference.positions = Trim(text.substr(numberEnd));
        m_desc.references.push_back(reference);
    } else if (key == "COMMENT") {
        for (const std::string& line : section.lines) {
            if (TakeSuiteDataLine(line, m_suiteData)) {
                m_hasSuiteData = true;
            } else {
                m_desc.comments.push_back(line);
            }
        }
    } else if (key == "DBLINK" || key == "DBSOURCE") {
        for (const std::string& line : section.lines) {
            if (!Trim(line).empty())
                m_desc.dbLinks.push_back(Trim(line));
        }
    } else {
        ApplyReferencePart(section);
    }
}

void CGenBankParser::ApplyOrganism(const CSection& section) {
    m_desc.organism = Trim(section.lines.front());
    CSection lineage{"", {section.lines.begin() + 1, section.lines.end()}};
    m_desc.taxonomy = SplitList(StripTrailing(Joined(lineage), '.'), ';');
}

void CGenBankParser::ApplyReferencePart(const CSection& section) {
    const std::string& key = section.keyword;
    if (key == "AUTHORS") {
        CurrentReference().authors = Joined(section);
    } else if (key == "TITLE") {
        CurrentReference().title = Joined(section);
    } else if (key == "JOURNAL") {
        CurrentReference().journal = Joined(section);
    } else if (key == "PUBMED") {
        CurrentReference().pubmed = Joined(section);
    } else if (key == "MEDLINE") {
        CurrentReference().medline = Joined(section);
    } else if (key == "REMARK") {
        CurrentReference().comment = Joined(section);
    }
}

}  // namespace

int ReadGenBank(CSxMol& molecule, CSxStream& stream) {
    molecule.ClearForReading();
    molecule.Description().database = molecule.Kind() == kKindProtein ? "GenPept" : "GenBank";
    return CGenBankParser(molecule, stream).Read();
}
