#include "ScoreMatrix.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

#include "BuiltinMatrices.h"
#include "SimBlockParameters.h"
#include "TextTokens.h"
#include "archive/FileIO.h"

namespace {
// Residue codes are single bytes (0 means none), so no alphabet can usefully exceed this.
constexpr std::size_t kMaxLetters = 255;
// Matrix files are a few kilobytes; anything far larger is not a matrix file.
constexpr std::size_t kMaxFileBytes = std::size_t{64} << 20;
// Characters a header line may consist of, besides blanks.
constexpr std::string_view kHeaderLetters = "ABCDEFGHIKLMNPQRSTVWXYZ*abcdefghiklmnpqrstvwxyzJjOoUu";

std::string AlphabetOfType(std::int32_t type) {
    if (type == kProteinType)
        return CScoreMatrix::kProteinAlphabet;
    if (type == kNucleotideType)
        return CScoreMatrix::kNucleotideAlphabet;
    return {};
}

bool IsBlank(char c) {
    return c == ' ' || c == '\t' || c == '\r' || c == '\v' || c == '\f';
}

// The letters of a header line (blanks removed), or none when it is not a header.
std::optional<std::string> HeaderLetters(std::string_view line) {
    std::string letters;
    for (char c : line) {
        if (IsBlank(c))
            continue;
        if (kHeaderLetters.find(c) == std::string_view::npos)
            return std::nullopt;
        letters += c;
    }
    if (letters.empty())
        return std::nullopt;
    return letters;
}

// The file name up to its first ".".
std::string TitleOf(const std::string& path) {
    const std::string name = FileNameOf(path);
    return name.substr(0, name.find('.'));
}

std::optional<int> ToInt(double value) {
    if (!(value >= std::numeric_limits<int>::min() && value <= std::numeric_limits<int>::max())) {
        return std::nullopt;
    }
    return static_cast<int>(value);
}
}  // namespace

CScoreMatrix::CScoreMatrix(const std::string& name, std::int32_t type) {
    LoadBuiltin(name, type);
}

CScoreMatrix CScoreMatrix::Default() {
    return CScoreMatrix(kDefaultMatrixName, kProteinType);
}

bool CScoreMatrix::LoadBuiltin(const std::string& name, std::int32_t type) {
    m_alphabet = AlphabetOfType(type);
    m_type = type;
    ResetScores();
    m_statistics.Clear();
    const CBuiltinMatrix* table = FindBuiltinMatrix(name);
    // A table packed for the other letter order cannot fill this alphabet.
    if (!table || m_size == 0 || table->type != type)
        return false;
    std::size_t next = 0;
    for (int row = 0; row < m_size; ++row) {
        for (int column = 0; column <= row; ++column) {
            const int score = table->triangle[next++];
            SetScoreAt(row, column, score);
            SetScoreAt(column, row, score);
        }
    }
    m_name = name;
    return true;
}

bool CScoreMatrix::LoadBuiltinOrFile(const std::string& nameOrPath) {
    if (const CBuiltinMatrix* table = FindBuiltinMatrix(nameOrPath)) {
        return LoadBuiltin(nameOrPath, table->type);
    }
    return ReadTextFile(nameOrPath);
}

bool CScoreMatrix::SetAlphabet(const std::string& letters) {
    if (letters.size() > kMaxLetters)
        return false;
    const int size = static_cast<int>(letters.size());
    const int kept = std::min(size, m_size);
    std::vector<int> scores(static_cast<std::size_t>(size) * size, 0);
    for (int row = 0; row < kept; ++row) {
        for (int column = 0; column < kept; ++column) {
            scores[static_cast<std::size_t>(row) * size + column] = ScoreAt(row, column);
        }
    }
    m_alphabet = letters;
    m_size = size;
    m_scores = std::move(scores);
    return m_size > 0;
}

void CScoreMatrix::Clear() {
    m_alphabet.clear();
    m_name.clear();
    ResetScores();
}

bool CScoreMatrix::InsertLetters(std::size_t position, const std::string& letters) {
    if (position > m_alphabet.size() || letters.empty())
        return false;
    if (m_alphabet.size() + letters.size() > kMaxLetters)
        return false;
    const CScoreMatrix old = *this;
    const int inserted = static_cast<int>(letters.size());
    m_alphabet.insert(position, letters);
    ResetScores();
    // Old index i moves behind the inserted letters when it is at or after `position`.
    auto moved = [&](int i) { return i < static_cast<int>(position) ? i : i + inserted; };
    for (int row = 0; row < old.m_size; ++row) {
        for (int column = 0; column < old.m_size; ++column) {
            SetScoreAt(moved(row), moved(column), old.ScoreAt(row, column));
        }
    }
    return true;
}

bool CScoreMatrix::DeleteLetters(std::size_t position, const std::string& letters) {
    if (position > m_alphabet.size() || letters.empty())
        return false;
    const CScoreMatrix old = *this;
    const int first = static_cast<int>(position);
    const int removed = static_cast<int>(std::min(letters.size(), m_alphabet.size() - position));
    m_alphabet.erase(position, removed);
    ResetScores();
    // New index i comes from behind the removed letters when it is at or after `position`.
    auto source = [&](int i) { return i < first ? i : i + removed; };
    for (int row = 0; row < m_size; ++row) {
        for (int column = 0; column < m_size; ++column) {
            SetScoreAt(row, column, old.ScoreAt(source(row), source(column)));
        }
    }
    return true;
}

bool CScoreMatrix::Equals(const CScoreMatrix& other) const {
    return m_name == other.m_name && m_alphabet == other.m_alphabet && other.IsValid() &&
           m_scores == other.m_scores;
}

std::optional<int> CScoreMatrix::DefaultCutoff() const {
    if (m_frequencies.Count() < kWindowLength || m_size == 0)
        return std::nullopt;
    return ToInt(static_cast<double>(LargestLowerScore()) * kWindowLength);
}

std::optional<int> CScoreMatrix::ExpectedWindowScore() const {
    if (m_frequencies.Count() < kWindowLength || m_size == 0)
        return std::nullopt;
    double sum = 0.0;
    bool counted = false;
    for (int row = 0; row < m_size; ++row) {
        const std::optional<double> rowFrequency = m_frequencies.FrequencyOf(m_alphabet[row]);
        if (!rowFrequency)
            continue;
        for (int column = 0; column < m_size; ++column) {
            const std::optional<double> columnFrequency =
                m_frequencies.FrequencyOf(m_alphabet[column]);
            if (!columnFrequency)
                continue;
            sum += ScoreAt(row, column) * *rowFrequency * *columnFrequency;
            counted = true;
        }
    }
    if (!counted)
        return std::nullopt;
    return ToInt(std::trunc(kWindowLength * sum));
}

bool CScoreMatrix::Encode(std::string_view sequence, std::vector<std::uint8_t>& codes) const {
    std::array<std::uint8_t, 256> codeOf{};
    const int coded = std::min(m_size, static_cast<int>(kMaxLetters));
    for (int i = 0; i < coded; ++i) {
        std::uint8_t& code = codeOf[static_cast<unsigned char>(m_alphabet[i])];
        if (code == 0)
            code = static_cast<std::uint8_t>(i + 1);
    }
    codes.resize(sequence.size());
    for (std::size_t i = 0; i < sequence.size(); ++i) {
        unsigned char c = static_cast<unsigned char>(sequence[i]);
        if (c >= 'a' && c <= 'z')
            c = static_cast<unsigned char>(c - 'a' + 'A');
        codes[i] = codeOf[c];
        if (codes[i] == 0)
            return false;
    }
    return true;
}

bool CScoreMatrix::ReadTextFile(const std::string& path) {
    std::vector<std::uint8_t> bytes;
    try {
        bytes = ReadWholeFile(path, kMaxFileBytes);
    } catch (const CFileException& e) {
        m_lastError = e.what();
        return false;
    }
    const std::string_view text(reinterpret_cast<const char*>(bytes.data()), bytes.size());
    return ReadText(text, TitleOf(path));
}

bool CScoreMatrix::ReadText(std::string_view text, const std::string& name) {
    const std::vector<CTextLine> lines = DataLines(text);
    std::size_t header = 0;
    std::optional<std::string> letters;
    while (header < lines.size() && !(letters = HeaderLetters(lines[header].text)))
        ++header;
    if (!letters) {
        m_lastError = "no header line with the matrix letters";
        return false;
    }
    CScoreMatrix result(*this);
    result.m_name = name;
    if (!result.SetAlphabet(*letters)) {
        m_lastError = "line " + std::to_string(lines[header].number) + ": more than " +
                      std::to_string(kMaxLetters) + " letters in the header line";
        return false;
    }
    result.ResetScores();
    std::size_t next = header + 1;
    for (int row = 0; row < result.m_size; ++row, ++next) {
        const bool read = next < lines.size() ? result.ReadRow(row, lines[next])
                                              : result.MissingRow(row, lines.back().number);
        if (!read) {
            m_lastError = result.m_lastError;
            return false;
        }
    }
    const std::vector<CTextLine> statistics(lines.begin() + static_cast<std::ptrdiff_t>(next),
                                            lines.end());
    std::string error;
    if (!result.m_statistics.ReadTextLines(statistics, error)) {
        m_lastError = error;
        return false;
    }
    if (!result.CheckDefaultCutoff()) {
        m_lastError = result.m_lastError;
        return false;
    }
    result.m_lastError.clear();
    *this = std::move(result);
    return true;
}

bool CScoreMatrix::ReadRow(int row, const CTextLine& line) {
    const std::string where = "line " + std::to_string(line.number) + ": ";
    const std::string letter(1, m_alphabet[row]);
    const std::vector<std::string_view> tokens = SplitTokens(line.text);
    if (tokens.empty() || tokens.front() != letter) {
        m_lastError = where + "row " + letter + " expected, found \"" +
                      std::string(line.text.substr(0, 20)) + "\"";
        return false;
    }
    const std::size_t values = tokens.size() - 1;
    if (values != static_cast<std::size_t>(m_size)) {
        m_lastError = where + "row " + letter + " has " + std::to_string(values) + " values, " +
                      std::to_string(m_size) + " expected";
        return false;
    }
    for (std::size_t column = 0; column < values; ++column) {
        const std::string_view token = tokens[column + 1];
        std::int32_t score = 0;
        const NumberParse parsed = ParseInteger(token, score);
        if (parsed != NumberParse::ok) {
            m_lastError = where + "\"" + std::string(token) + "\" in row " + letter +
                          (parsed == NumberParse::outOfRange ? " is beyond 32 bits"
                                                             : " is not a whole number");
            return false;
        }
        SetScoreAt(row, static_cast<int>(column), score);
    }
    return true;
}

bool CScoreMatrix::MissingRow(int row, int lastLine) {
    m_lastError = "the file ends at line " + std::to_string(lastLine) + " before row " +
                  std::string(1, m_alphabet[row]) + " (row " + std::to_string(row + 1) + " of " +
                  std::to_string(m_size) + ")";
    return false;
}

bool CScoreMatrix::CheckDefaultCutoff() {
    const std::int64_t cutoff = std::int64_t{kWindowLength} * LargestLowerScore();
    if (cutoff >= 1 && cutoff <= std::numeric_limits<int>::max())
        return true;
    m_lastError = "the default cutoff, " + std::to_string(kWindowLength) +
                  " times the largest score " + std::to_string(LargestLowerScore()) + ", is " +
                  std::to_string(cutoff) +
                  (cutoff < 1 ? "; a cutoff must be at least 1" : ", beyond 32 bits");
    return false;
}

int CScoreMatrix::LargestLowerScore() const {
    int largest = ScoreAt(0, 0);
    for (int row = 0; row < m_size; ++row) {
        for (int column = 0; column <= row; ++column)
            largest = std::max(largest, ScoreAt(row, column));
    }
    return largest;
}

std::string CScoreMatrix::ToText() const {
    std::string out = "#  Matrix made by Tiler\n";
    AppendCommentLine(out, m_name);
    AppendCommentLines(out, m_comment);
    out += " ";
    for (char letter : m_alphabet)
        out += std::string("  ") + letter;
    out += "\n";
    for (int row = 0; row < m_size; ++row) {
        out += m_alphabet[row];
        for (int column = 0; column < m_size; ++column) {
            const std::string number = std::to_string(ScoreAt(row, column));
            const std::size_t width = std::max<std::size_t>(3, number.size() + 1);
            out += std::string(width - number.size(), ' ') + number;
        }
        out += "\n";
    }
    m_statistics.AppendText(out);
    return out;
}

bool CScoreMatrix::WriteTextFile(const std::string& path) const {
    try {
        WriteFileAtomically(path, ToText());
    } catch (const CFileException& e) {
        m_lastError = e.what();
        return false;
    }
    return true;
}

void CScoreMatrix::Serialize(CArchive& ar) {
    if (ar.IsStoring()) {
        ar.XMember(m_name);
        ar.XMember(m_alphabet);
        for (int& score : m_scores)
            ar.XMember(score);
        ar.XMember(m_type);
        ar.XData(m_statistics);
        return;
    }
    // Everything is read into a fresh matrix first, so a failed read leaves this one intact.
    CScoreMatrix loaded;
    std::string alphabet;
    ar.XMember(loaded.m_name);
    ar.XMember(alphabet);
    if (alphabet.size() > kMaxLetters) {
        throw CArchiveException(CArchiveException::genericError,
                                "score matrix with more than 255 letters");
    }
    loaded.SetAlphabet(alphabet);
    for (int& score : loaded.m_scores)
        ar.XMember(score);
    if (!ar.AtEnd())
        ar.XMember(loaded.m_type);
    if (!ar.AtEnd())
        ar.XData(loaded.m_statistics);
    *this = std::move(loaded);
}

void CScoreMatrix::ResetScores() {
    m_size = static_cast<int>(m_alphabet.size());
    m_scores.assign(static_cast<std::size_t>(m_size) * m_size, 0);
}

TB_REGISTER_CLASS(CScoreMatrix);
