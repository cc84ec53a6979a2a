// EMBL and SWISS-PROT entries: every line starts with a two-letter line code, its text from
// column 6; "SQ" is followed by the sequence lines and "//" ends the entry.

#include <algorithm>

#include "import/FeatureTableReader.h"
#include "import/HeaderWords.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"
#include "import/SeqText.h"
#include "import/SuiteData.h"

namespace {

constexpr std::size_t kTextColumn = 5;

// EMBL data classes, which share the header with the (also three-letter) division.
constexpr std::string_view kDataClasses[] = {"CON", "PAT", "EST", "GSS", "HTC", "HTG",
                                             "MGA", "WGS", "TSA", "STS", "STD"};

std::string TextOf(const std::string& line) {
    return line.size() > kTextColumn ? TrimRight(std::string_view(line).substr(kTextColumn))
                                     : std::string();
}

std::string Joined(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) {
        std::string part = Trim(line);
        if (part.empty())
            continue;
        if (!text.empty())
            text += ' ';
        text += part;
    }
    return text;
}

bool IsDivision(const std::string& piece) {
    return piece.size() == 3 &&
           std::all_of(piece.begin(), piece.end(), [](char c) { return c >= 'A' && c <= 'Z'; }) &&
           std::find(std::begin(kDataClasses), std::end(kDataClasses), piece) ==
               std::end(kDataClasses);
}

// "genomic DNA", "mRNA": printable words naming a nucleic acid and none naming a protein, so
// that the writers can put it back into a header.
bool IsMoleculeType(const std::string& piece) {
    const bool printable =
        std::all_of(piece.begin(), piece.end(), [](char c) { return c >= ' ' && c <= '~'; });
    const std::vector<std::string> words = SplitTokens(piece);
    return printable && (Contains(piece, "DNA") || Contains(piece, "RNA")) &&
           std::none_of(words.begin(), words.end(), [](const std::string& word) {
               return TypeOfHeaderWord(word) == kTypeProtein;
           });
}

// "PubMed=6452630; DOI=...;" or the older "MEDLINE; 80137531." lines.
void ApplyCrossReference(const std::string& text, CSxReference& reference) {
    std::vector<std::string> pieces = SplitList(StripTrailing(text, '.'), ';');
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        std::string piece = pieces[i];
        std::size_t equals = piece.find('=');
        std::string database = ToUpper(Trim(piece.substr(0, equals)));
        std::string id;
        if (equals != std::string::npos) {
            id = Trim(piece.substr(equals + 1));
        } else if (i + 1 < pieces.size()) {
            id = pieces[++i];
        }
        if (database == "PUBMED")
            reference.pubmed = id;
        if (database == "MEDLINE")
            reference.medline = id;
    }
}

std::string Unquoted(std::string text) {
    text = StripTrailing(text, ';');
    if (text.size() >= 2 && text.front() == '"' && text.back() == '"') {
        text = text.substr(1, text.size() - 2);
    }
    return text;
}

class CEmblParser {
  public:
    CEmblParser(CSxMol& molecule, CSxStream& stream) : m_mol(molecule), m_stream(stream) {}
    int Read();

  private:
    int ReadHeader(const std::string& line);
    void ReadBody();
    void ReadSequence();
    void Flush();
    void Apply(const std::string& code, const std::vector<std::string>& lines);
    void ApplyReference(const std::string& code, const std::vector<std::string>& lines);

    CSxMol& m_mol;
    CSxStream& m_stream;
    CSxDescription& m_desc = m_mol.Description();
    std::string m_code;  // code of the lines gathered in m_lines
    std::vector<std::string> m_lines;
    CFeatureTableReader m_features;
    std::string m_suiteData;
    bool m_hasSuiteData = false;
    std::string m_sequence;
};

int CEmblParser::Read() {
    std::string line;
    for (;;) {
        if (!m_stream.ReadLine(line))
            return kNoMoreRecords;
        if (StartsWith(line, "ID "))
            break;
    }
    m_stream.MarkRecordStart();
    if (int result = ReadHeader(line))
        return result;
    ReadBody();
    m_desc.features = m_features.Finish();
    if (m_hasSuiteData && !ReadSuiteData(m_suiteData, m_mol))
        return kBadSuiteData;
    if (m_sequence.empty())
        return kNoSequence;
    m_mol.SetSequence(std::move(m_sequence));
    return kReadOne;
}

int CEmblParser::ReadHeader(const std::string& line) {
    std::vector<std::string> tokens = SplitTokens(line);
    if (tokens.size() < 2)
        return kNoName;
    std::string name = tokens[1];
    if (name.back() == ';')
        name.pop_back();
    if (name.empty())
        return kNoName;
    std::replace(name.begin(), name.end(), '\\', ' ');
    m_mol.SetName(name);
    // The header's pieces are separated by ';' as well as blanks: "PRT;153 AA." names PRT.
    std::string words = line;
    std::replace(words.begin(), words.end(), ';', ' ');
    if (int result = ApplyHeaderWords(m_mol, SplitTokens(words)))
        return result;
    // EMBL: "ID   X56734; SV 1; linear; mRNA; STD; PLN; 1859 BP." or "ID   HSHBA1 standard;
    // DNA; HUM; 1000 BP.": the molecule type and the division are pieces between ';'.
    // SWISS-PROT headers name neither.
    if (m_mol.Kind() != kKindNucleic)
        return 0;
    // The first piece holds the name, whatever it reads like.
    const std::vector<std::string> pieces = SplitList(TextOf(line), ';');
    for (std::size_t i = 1; i < pieces.size(); ++i) {
        const std::string& piece = pieces[i];
        if (m_desc.moleculeType.empty() && IsMoleculeType(piece))
            m_desc.moleculeType = piece;
        if (IsDivision(piece))
            m_desc.division = piece;
    }
    return 0;
}

void CEmblParser::ReadBody() {
    std::string line;
    while (m_stream.ReadLine(line)) {
        if (StartsWith(line, "//"))
            break;
        if (StartsWith(line, "ID ")) {  // a new entry without "//" before it
            m_stream.UnreadLine();
            break;
        }
        std::string code = line.substr(0, std::min<std::size_t>(2, line.size()));
        if (code == "SQ") {
            Flush();
            ReadSequence();
            return;
        }
        if (code == "FT") {
            m_features.AddLine("  " + line.substr(2));
            continue;
        }
        // A new reference, or another line code, closes the gathered lines.
        if (code != m_code || code == "RN")
            Flush();
        m_code = code;
        m_lines.push_back(TextOf(line));
    }
    Flush();
}

void CEmblParser::ReadSequence() {
    std::string line;
    while (m_stream.ReadLine(line)) {
        if (Contains(line, "//"))
            return;
        if (StartsWith(line, "ID   ")) {  // the next entry, without "//" before it
            m_stream.UnreadLine();
            return;
        }
        AppendResidues(m_sequence, line);
    }
}

void CEmblParser::Flush() {
    if (!m_lines.empty())
        Apply(m_code, m_lines);
    m_lines.clear();
    m_code.clear();
}

void CEmblParser::Apply(const std::string& code, const std::vector<std::string>& lines) {
    if (code == "DE") {
        m_desc.definition = Joined(lines);
    } else if (code == "AC") {
        for (std::string& accession : SplitList(Joined(lines), ';')) {
            m_desc.accessions.push_back(std::move(accession));
        }
    } else if (code == "DT") {
        // The last date line is the latest change: "15-MAR-2017, entry version 1."
        std::string last = Trim(lines.back());
        std::string date = last.substr(0, last.find_first_of(", ("));
        if (IsDatabaseDate(date))
            m_desc.dbDate = date;
    } else if (code == "KW") {
        m_desc.keywords = SplitList(StripTrailing(Joined(lines), '.'), ';');
    } else if (code == "OS") {
        m_desc.organism = StripTrailing(Joined(lines), '.');
    } else if (code == "OC") {
        m_desc.taxonomy = SplitList(StripTrailing(Joined(lines), '.'), ';');
    } else if (code == "DR") {
        for (const std::string& line : lines)
            m_desc.dbLinks.push_back(Trim(line));
    } else if (code == "CC") {
        for (const std::string& line : lines) {
            if (TakeSuiteDataLine(line, m_suiteData)) {
                m_hasSuiteData = true;
            } else {
                m_desc.comments.push_back(line);
            }
        }
    } else if (code.size() == 2 && code[0] == 'R') {
        ApplyReference(code, lines);
    }
}

void CEmblParser::ApplyReference(const std::string& code, const std::vector<std::string>& lines) {
    if (code == "RN") {
        CSxReference reference;
        std::string text = Joined(lines);
        std::size_t digit = text.find_first_of("0123456789");
        if (digit != std::string::npos)
            reference.number = std::atoi(text.c_str() + digit);
        m_desc.references.push_back(reference);
        return;
    }
    if (m_desc.references.empty())
        m_desc.references.emplace_back();
    CSxReference& reference = m_desc.references.back();
    std::string text = Joined(lines);
    if (code == "RP") {
        reference.positions = text;
    } else if (code == "RC") {
        reference.comment = text;
    } else if (code == "RX") {
        ApplyCrossReference(text, reference);
    } else if (code == "RA") {
        reference.authors = StripTrailing(text, ';');
    } else if (code == "RT") {
        reference.title = Unquoted(text);
    } else if (code == "RL") {
        reference.journal = text;
    }
}

}  // namespace

int ReadEmbl(CSxMol& molecule, CSxStream& stream) {
    molecule.ClearForReading();
    molecule.Description().database = molecule.Kind() == kKindProtein ? "SWISS-PROT" : "EMBL";
    return CEmblParser(molecule, stream).Read();
}
