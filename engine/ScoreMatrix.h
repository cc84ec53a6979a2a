#pragma once
// A substitution matrix: a square table of integer scores over a residue alphabet, with a
// background frequency set and a statistics table. Built-in tables, plain text files and the
// archive are its sources.

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "FreqSet.h"
#include "StatTable.h"
#include "archive/Archive.h"

// Sequence types of a matrix (and of the built-in tables).
enum MatrixSequenceType : std::int32_t {
    kNoSequenceType = 0,
    kNucleotideType = 1,
    kProteinType = 2,
};

class CScoreMatrix : public CSerializable {
  public:
    TB_CLASS_TAG("ScoreMatrix")
    // Residues per window, the unit of the default cutoff and the expected window score.
    static constexpr int kWindowLength = 3;
    static constexpr const char* kProteinAlphabet = "ABCDEFGHIKLMNPQRSTVWXYZ";
    static constexpr const char* kNucleotideAlphabet = "ABCDGHKMNRSTUVWXY";

    // An empty matrix: no alphabet, no name, type 0, the default frequency set.
    CScoreMatrix() = default;
    // The built-in matrix `name` (see LoadBuiltin; check IsValid() for success).
    explicit CScoreMatrix(const std::string& name, std::int32_t type = kProteinType);

    // The program's default matrix: the built-in "blosum62mt", protein type. Used wherever a
    // stored or chosen matrix is unusable and must be replaced.
    static CScoreMatrix Default();

    // Loads the built-in table `name` (case-sensitive). The alphabet follows `type` (protein,
    // nucleotide, otherwise empty) and the type is kept. On an unknown name or empty alphabet
    // the scores are all 0, the name is unchanged, and the result is false.
    bool LoadBuiltin(const std::string& name, std::int32_t type);

    // `nameOrPath` as a built-in name (with the table's own type) or else as a matrix text
    // file (see ReadTextFile). False, with LastError() and the matrix unchanged, when neither.
    bool LoadBuiltinOrFile(const std::string& nameOrPath);

    // Replaces the alphabet, keeping cells at the same row and column index and zero-filling
    // new ones. True when the alphabet is not empty.
    bool SetAlphabet(const std::string& letters);
    // Empties the alphabet, the table and the name.
    void Clear();
    // Inserts `letters` at alphabet index `position`; every existing score keeps its letter
    // pair and the new rows and columns are 0. False (unchanged) when position > size or
    // letters is empty.
    bool InsertLetters(std::size_t position, const std::string& letters);
    // Removes letters.size() letters starting at `position` (fewer when the alphabet ends);
    // the remaining pairs keep their scores. False (unchanged) when position > size or
    // letters is empty.
    bool DeleteLetters(std::size_t position, const std::string& letters);

    // The score of two residue codes (1-based alphabet positions, see Encode).
    int Score(int rowCode, int columnCode) const {
        return m_scores[static_cast<std::size_t>(rowCode - 1) * m_size + (columnCode - 1)];
    }
    // The score at 0-based row and column indexes.
    int ScoreAt(int row, int column) const { return Score(row + 1, column + 1); }
    void SetScoreAt(int row, int column, int score) {
        m_scores[static_cast<std::size_t>(row) * m_size + column] = score;
    }
    // The whole table, Size() x Size() values row by row.
    const std::vector<int>& Scores() const { return m_scores; }
    // The alphabet length n.
    int Size() const { return m_size; }

    // Same name (case-sensitive) and alphabet, `other` valid, every score equal.
    bool Equals(const CScoreMatrix& other) const;
    // A non-empty alphabet with its n x n table.
    bool IsValid() const { return m_size > 0; }

    // Window length x the largest score of the lower triangle; none when the frequency set
    // has fewer entries than the window length or the alphabet is empty.
    std::optional<int> DefaultCutoff() const;
    // Window length x the expected score of a residue pair under the background frequencies,
    // truncated toward zero; none under the same conditions as DefaultCutoff, when no letter
    // pair has frequencies, or when the result does not fit an int.
    std::optional<int> ExpectedWindowScore() const;

    // Encodes `sequence` for scoring: each character upper-cased and looked up in the
    // alphabet (first occurrence), code = position + 1. False, with `codes` unspecified, when
    // a character is not in the alphabet or its code would not fit in a byte.
    bool Encode(std::string_view sequence, std::vector<std::uint8_t>& codes) const;

    // Reads a matrix text file. The name becomes the file name up to its first "."; type,
    // comment and frequencies stay as they were. The header line must be followed by one row
    // per letter, in header order, each its letter and exactly one whole number per letter;
    // every line after the rows must be a statistics line; the default cutoff must come out
    // at 1 or more. On failure (an unreadable file, no header line, a missing, short, long or
    // misplaced row, a value that is no whole number, a bad statistics line, a cutoff below 1)
    // the matrix is left unchanged, false is returned and LastError() says why, naming the
    // line.
    bool ReadTextFile(const std::string& path);
    // The same from text already in memory, naming the matrix `name`.
    bool ReadText(std::string_view text, const std::string& name);
    // Writes the matrix as a text file, atomically replacing `path`. False (with LastError())
    // when the file cannot be written.
    bool WriteTextFile(const std::string& path) const;
    // The text that WriteTextFile writes.
    std::string ToText() const;
    // Why the last ReadTextFile, ReadText or WriteTextFile failed.
    const std::string& LastError() const { return m_lastError; }

    // Stores name, alphabet and scores, then the type and the statistics table. Older records
    // without the last two read as type 0 and empty statistics. A matrix read from an archive
    // has the default frequency set and no comment.
    void Serialize(CArchive& ar) override;

    const std::string& Name() const { return m_name; }
    void SetName(std::string name) { m_name = std::move(name); }
    const std::string& Alphabet() const { return m_alphabet; }
    std::int32_t Type() const { return m_type; }
    void SetType(std::int32_t type) { m_type = type; }
    const std::string& Comment() const { return m_comment; }
    void SetComment(std::string comment) { m_comment = std::move(comment); }
    const CFreqSet& Frequencies() const { return m_frequencies; }
    void SetFrequencies(CFreqSet frequencies) { m_frequencies = std::move(frequencies); }
    const CStatTable& Statistics() const { return m_statistics; }
    CStatTable& Statistics() { return m_statistics; }
    int WindowLength() const { return kWindowLength; }

  private:
    // Sizes the table for the current alphabet, every cell 0.
    void ResetScores();
    // Reads the scores of row `row` from its line; false (with m_lastError) when the line is
    // not that row with one whole number per letter.
    bool ReadRow(int row, const CTextLine& line);
    // Says (false, m_lastError) that the file ended after `lastLine` before row `row`.
    bool MissingRow(int row, int lastLine);
    // False (with m_lastError) when the default cutoff would be below 1 or beyond an int.
    bool CheckDefaultCutoff();
    // The largest score of the lower triangle, the diagonal included.
    int LargestLowerScore() const;

    std::string m_name;
    std::string m_alphabet;
    int m_size = 0;
    std::int32_t m_type = kNoSequenceType;
    std::string m_comment;
    CFreqSet m_frequencies;
    std::vector<int> m_scores;
    CStatTable m_statistics;
    mutable std::string m_lastError;
};
