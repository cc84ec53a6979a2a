#include "ScoreMatrix.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>

#include "BuiltinMatrices.h"
#include "archive/FileIO.h"
#include "engine/MatrixReference.h"

namespace fs = std::filesystem;

namespace {

class TempDir {
  public:
    TempDir() {
        std::random_device seed;
        m_path = fs::temp_directory_path() / ("tb_matrix_" + std::to_string(seed()));
        fs::create_directories(m_path);
    }
    ~TempDir() { fs::remove_all(m_path); }
    std::string File(const std::string& name, const std::string& text = {}) const {
        const std::string path = (m_path / name).string();
        if (!text.empty())
            std::ofstream(path, std::ios::binary) << text;
        return path;
    }

  private:
    fs::path m_path;
};

// A small matrix over `letters` with distinct scores, so that misplaced cells show.
CScoreMatrix Numbered(const std::string& letters) {
    CScoreMatrix matrix;
    matrix.SetAlphabet(letters);
    for (int row = 0; row < matrix.Size(); ++row) {
        for (int column = 0; column < matrix.Size(); ++column) {
            matrix.SetScoreAt(row, column, 10 * (row + 1) + column + 1);
        }
    }
    return matrix;
}

// The score of a letter pair, looked up by letter.
int ScoreOf(const CScoreMatrix& matrix, char row, char column) {
    const std::string& letters = matrix.Alphabet();
    return matrix.ScoreAt(static_cast<int>(letters.find(row)),
                          static_cast<int>(letters.find(column)));
}

std::vector<std::uint8_t> Store(CScoreMatrix& matrix) {
    CArchive ar = CArchive::ForWriting();
    ar.XData(matrix);
    return ar.Bytes();
}

void Load(const std::vector<std::uint8_t>& bytes, CScoreMatrix& matrix) {
    CArchive ar = CArchive::ForReading(bytes);
    ar.XData(matrix);
}

}  // namespace

TEST(ScoreMatrixBuiltins, EveryTableMatchesItsReference) {
    ASSERT_EQ(BuiltinMatrices().size(), ReferenceMatrixNames().size());
    for (const std::string& name : ReferenceMatrixNames()) {
        const ReferenceMatrix reference = LoadReferenceMatrix(name);
        const int type = reference.letters.size() == 23 ? kProteinType : kNucleotideType;
        CScoreMatrix matrix;
        ASSERT_TRUE(matrix.LoadBuiltin(name, type)) << name;
        EXPECT_EQ(matrix.Name(), name);
        EXPECT_EQ(matrix.Type(), type);
        ASSERT_EQ(matrix.Alphabet(), reference.letters) << name;
        for (int row = 0; row < matrix.Size(); ++row) {
            for (int column = 0; column < matrix.Size(); ++column) {
                EXPECT_EQ(matrix.Score(row + 1, column + 1), reference.rows[row][column])
                    << name << " " << reference.letters[row] << reference.letters[column];
            }
        }
        EXPECT_TRUE(matrix.Statistics().IsEmpty());
    }
}

TEST(ScoreMatrixBuiltins, PublishedValuesAndDoubledTable) {
    const CScoreMatrix blosum62("blosum62mt");
    EXPECT_EQ(ScoreOf(blosum62, 'W', 'W'), 11);
    EXPECT_EQ(ScoreOf(blosum62, 'C', 'C'), 9);
    EXPECT_EQ(ScoreOf(blosum62, 'W', 'C'), -2);
    const auto [smallest, largest] =
        std::minmax_element(blosum62.Scores().begin(), blosum62.Scores().end());
    EXPECT_EQ(*smallest, -4);
    EXPECT_EQ(*largest, 11);
    EXPECT_EQ(ScoreOf(CScoreMatrix("gon250mt"), 'W', 'W'), 142);

    const CScoreMatrix doubled("blosum62mt2");
    ASSERT_EQ(doubled.Scores().size(), blosum62.Scores().size());
    for (std::size_t i = 0; i < doubled.Scores().size(); ++i) {
        EXPECT_EQ(doubled.Scores()[i], 2 * blosum62.Scores()[i]);
    }
    EXPECT_EQ(doubled.DefaultCutoff(), 66);
}

TEST(ScoreMatrixBuiltins, UnknownNameOrWrongTypeKeepsNameAndZeroesScores) {
    CScoreMatrix matrix("blosum62mt");
    EXPECT_FALSE(matrix.LoadBuiltin("Blosum62mt", kProteinType));  // names are case-sensitive
    EXPECT_EQ(matrix.Name(), "blosum62mt");
    EXPECT_EQ(matrix.Alphabet(), CScoreMatrix::kProteinAlphabet);
    EXPECT_TRUE(std::all_of(matrix.Scores().begin(), matrix.Scores().end(),
                            [](int score) { return score == 0; }));

    EXPECT_FALSE(matrix.LoadBuiltin("clustalvdnamt", kProteinType));
    EXPECT_TRUE(std::all_of(matrix.Scores().begin(), matrix.Scores().end(),
                            [](int score) { return score == 0; }));

    EXPECT_FALSE(matrix.LoadBuiltin("blosum62mt", kNoSequenceType));
    EXPECT_EQ(matrix.Alphabet(), "");
    EXPECT_FALSE(matrix.IsValid());

    const CScoreMatrix fallback = CScoreMatrix::Default();
    EXPECT_EQ(fallback.Name(), "blosum62mt");
    EXPECT_EQ(fallback.Type(), kProteinType);
    EXPECT_TRUE(fallback.Equals(CScoreMatrix("blosum62mt")));
}

TEST(ScoreMatrixDerivedValues, DefaultCutoffsFollowTheLargestScore) {
    EXPECT_EQ(CScoreMatrix("blosum62mt").DefaultCutoff(), 33);
    EXPECT_EQ(CScoreMatrix("blosum80mt").DefaultCutoff(), 48);
    EXPECT_EQ(CScoreMatrix("idmat").DefaultCutoff(), 30);
    EXPECT_EQ(CScoreMatrix("swgapdnamt", kNucleotideType).DefaultCutoff(), 30);

    // Only the lower triangle counts: an upper-triangle maximum is ignored.
    CScoreMatrix skewed = Numbered("AR");  // 11 12 / 21 22
    skewed.SetScoreAt(0, 1, 500);
    EXPECT_EQ(skewed.DefaultCutoff(), 66);
    // All scores negative: the largest is still found.
    skewed.SetAlphabet("A");
    skewed.SetScoreAt(0, 0, -7);
    EXPECT_EQ(skewed.DefaultCutoff(), -21);
}

TEST(ScoreMatrixDerivedValues, ExpectedWindowScoreTruncatesTowardZero) {
    EXPECT_EQ(CScoreMatrix("blosum62mt").ExpectedWindowScore(), -2);
    // 3 x 10 x (0.081^2 + 0.015^2 + 0.068^2 + 0.058^2) = 0.443 for A, C, G and T.
    EXPECT_EQ(CScoreMatrix("clustalvdnamt", kNucleotideType).ExpectedWindowScore(), 0);

    CScoreMatrix single;
    single.SetAlphabet("A");
    single.SetScoreAt(0, 0, -100);  // 3 x -100 x 0.081^2 = -1.97
    EXPECT_EQ(single.ExpectedWindowScore(), -1);

    single.SetAlphabet("J");  // no background frequency for J
    EXPECT_EQ(single.ExpectedWindowScore(), std::nullopt);
    EXPECT_EQ(single.DefaultCutoff(), -300);
}

TEST(ScoreMatrixDerivedValues, TooFewFrequenciesOrNoLettersGiveNoValue) {
    CScoreMatrix matrix("blosum62mt");
    matrix.SetFrequencies(CFreqSet({0.5, 0.5, 0.5}, "AR"));  // count is the shorter: 2
    EXPECT_EQ(matrix.DefaultCutoff(), std::nullopt);
    EXPECT_EQ(matrix.ExpectedWindowScore(), std::nullopt);
    matrix.SetFrequencies(CFreqSet({0.5, 0.25, 0.25}, "ARN"));
    EXPECT_EQ(matrix.DefaultCutoff(), 33);
    // Only A, R and N have frequencies: A-A 4 x .25, R-R 5 x .0625, N-N 6 x .0625,
    // A-R and R-A -1 x .125, A-N and N-A -2 x .125, R-N 0: sum .9375, times 3 is 2.81.
    EXPECT_EQ(matrix.ExpectedWindowScore(), 2);

    EXPECT_EQ(CScoreMatrix().DefaultCutoff(), std::nullopt);
    EXPECT_EQ(CScoreMatrix().ExpectedWindowScore(), std::nullopt);
}

TEST(ScoreMatrixEncoding, CodesAreOneBasedAlphabetPositions) {
    const CScoreMatrix matrix("blosum62mt");
    std::vector<std::uint8_t> codes;
    ASSERT_TRUE(matrix.Encode("MKVB", codes));
    EXPECT_EQ(codes, (std::vector<std::uint8_t>{12, 10, 19, 2}));
    ASSERT_TRUE(matrix.Encode("mkvb", codes));
    EXPECT_EQ(codes, (std::vector<std::uint8_t>{12, 10, 19, 2}));
    EXPECT_FALSE(matrix.Encode("mkv*", codes));
    EXPECT_FALSE(matrix.Encode("MK V", codes));
    EXPECT_FALSE(matrix.Encode("M\xc3\x89", codes));
    ASSERT_TRUE(matrix.Encode("", codes));
    EXPECT_TRUE(codes.empty());

    CScoreMatrix repeated;
    repeated.SetAlphabet("ABA");
    ASSERT_TRUE(repeated.Encode("aab", codes));
    EXPECT_EQ(codes, (std::vector<std::uint8_t>{1, 1, 2}));  // first occurrence wins
}

TEST(ScoreMatrixEditing, SetAlphabetKeepsCellsByIndex) {
    CScoreMatrix matrix = Numbered("ARN");
    EXPECT_TRUE(matrix.SetAlphabet("XYNQ"));
    EXPECT_EQ(matrix.Scores(),
              (std::vector<int>{11, 12, 13, 0, 21, 22, 23, 0, 31, 32, 33, 0, 0, 0, 0, 0}));
    EXPECT_TRUE(matrix.SetAlphabet("X"));
    EXPECT_EQ(matrix.Scores(), std::vector<int>{11});
    EXPECT_FALSE(matrix.SetAlphabet(""));
    EXPECT_FALSE(matrix.IsValid());
    EXPECT_FALSE(matrix.SetAlphabet(std::string(256, 'A')));
}

TEST(ScoreMatrixEditing, InsertAndDeleteKeepLetterPairs) {
    const CScoreMatrix original = Numbered("ARND");
    for (std::size_t position = 0; position <= 4; ++position) {
        CScoreMatrix matrix = original;
        ASSERT_TRUE(matrix.InsertLetters(position, "xy"));
        ASSERT_EQ(matrix.Size(), 6);
        for (char row : std::string("ARNDxy")) {
            for (char column : std::string("ARNDxy")) {
                const bool isNew = std::islower(row) || std::islower(column);
                EXPECT_EQ(ScoreOf(matrix, row, column), isNew ? 0 : ScoreOf(original, row, column))
                    << position << row << column;
            }
        }
        ASSERT_TRUE(matrix.DeleteLetters(position, "xy"));
        EXPECT_EQ(matrix.Alphabet(), "ARND");
        EXPECT_EQ(matrix.Scores(), original.Scores());
    }

    CScoreMatrix matrix = original;
    ASSERT_TRUE(matrix.DeleteLetters(1, "??"));  // removes R and N
    EXPECT_EQ(matrix.Alphabet(), "AD");
    EXPECT_EQ(matrix.Scores(), (std::vector<int>{11, 14, 41, 44}));
    ASSERT_TRUE(matrix.DeleteLetters(1, "?????"));  // only D is left to remove
    EXPECT_EQ(matrix.Alphabet(), "A");

    matrix = original;
    EXPECT_FALSE(matrix.InsertLetters(5, "x"));
    EXPECT_FALSE(matrix.InsertLetters(0, ""));
    EXPECT_FALSE(matrix.DeleteLetters(5, "x"));
    EXPECT_FALSE(matrix.DeleteLetters(0, ""));
    EXPECT_EQ(matrix.Scores(), original.Scores());
}

TEST(ScoreMatrixEditing, EqualsComparesNameLettersAndScores) {
    const CScoreMatrix a("blosum62mt");
    CScoreMatrix b = a;
    EXPECT_TRUE(a.Equals(b));
    b.SetComment("comment and type are not compared");
    b.SetType(kNoSequenceType);
    EXPECT_TRUE(a.Equals(b));
    b.SetScoreAt(22, 0, 5);
    EXPECT_FALSE(a.Equals(b));
    b = a;
    b.SetName("BLOSUM62MT");
    EXPECT_FALSE(a.Equals(b));
    EXPECT_FALSE(CScoreMatrix().Equals(CScoreMatrix()));  // the other must be valid

    b = a;
    b.Clear();
    EXPECT_EQ(b.Name(), "");
    EXPECT_FALSE(b.IsValid());
    EXPECT_TRUE(a.IsValid());  // copies are deep
}

TEST(ScoreMatrixText, WritesTheFileLayout) {
    CScoreMatrix matrix;
    matrix.SetAlphabet("AR");
    matrix.SetName("tiny");
    matrix.SetScoreAt(0, 0, 4);
    matrix.SetScoreAt(0, 1, -1);
    matrix.SetScoreAt(1, 0, -1000);
    matrix.SetScoreAt(1, 1, 100);
    matrix.SetComment(std::string(70, 'c') + "tail");
    EXPECT_EQ(matrix.ToText(),
              "#  Matrix made by Tiler\n"
              "#  tiny\n"
              "#  " +
                  std::string(70, 'c') +
                  "\n"
                  "#  tail\n"
                  "   A  R\n"
                  "A  4 -1\n"
                  "R -1000 100\n");

    matrix.Statistics().Set(3, 0.25, 0.05, true);
    matrix.Statistics().Set(12, 1.5, 0.123456, false);
    const std::string text = matrix.ToText();
    const std::string section = text.substr(text.find("R -1000 100\n") + 12);
    EXPECT_EQ(section,
              "\n"
              "#  Statistical constants computed according to Karlin & Altschul (1990). \n"
              "#   Proc.Natl.Acad.Sci.USA  87, 2264-2268.\n"
              "#\tm\tlambda\tK\n"
              "\t3\t0.2500\t0.0500\t*\n"
              "\t12\t1.5000\t0.1235\n");
}

TEST(ScoreMatrixText, RoundTripKeepsLettersScoresAndStatistics) {
    TempDir dir;
    CScoreMatrix matrix("gon250mt");
    matrix.SetComment("line one\nline two, which must not become a row");
    matrix.Statistics().Set(2, 0.3125, 0.0625, false);
    matrix.Statistics().Set(16, 0.125, 0.5, true);
    const std::string path = dir.File("family.v2.mat");
    ASSERT_TRUE(matrix.WriteTextFile(path));

    CScoreMatrix read;
    ASSERT_TRUE(read.ReadTextFile(path)) << read.LastError();
    EXPECT_EQ(read.Name(), "family");
    EXPECT_EQ(read.Alphabet(), matrix.Alphabet());
    EXPECT_EQ(read.Scores(), matrix.Scores());
    EXPECT_EQ(read.Type(), kNoSequenceType);
    EXPECT_EQ(read.Comment(), "");
    ASSERT_EQ(read.Statistics().Count(), 2u);
    for (std::size_t i = 0; i < 2; ++i) {
        const CStatConst& expected = *matrix.Statistics().Entries()[i];
        const CStatConst& actual = *read.Statistics().Entries()[i];
        EXPECT_EQ(actual.sequences, expected.sequences);
        EXPECT_EQ(actual.lambda, expected.lambda);
        EXPECT_EQ(actual.k, expected.k);
        EXPECT_EQ(actual.marked != 0, expected.marked != 0);
    }
}

TEST(ScoreMatrixText, ReadsSmallAndIncompleteFiles) {
    TempDir dir;
    CScoreMatrix matrix;
    matrix.SetType(kProteinType);
    ASSERT_TRUE(
        matrix.ReadTextFile(dir.File("two.txt", "# two letters\n  A   R\nA 4 -1\nR -1 5\n")));
    EXPECT_EQ(matrix.Name(), "two");
    EXPECT_EQ(matrix.Alphabet(), "AR");
    EXPECT_EQ(matrix.Scores(), (std::vector<int>{4, -1, -1, 5}));
    EXPECT_EQ(matrix.Type(), kProteinType);  // kept from before

    // A title line before the header, CR LF line ends, blank lines, commas and signs.
    ASSERT_TRUE(matrix.ReadTextFile(dir.File(
        "crlf.txt", "title line 1\r\n\r\n A  R  N\r\nA 1 0 0\r\n\r\nR,+7,-7,7\r\nN,3,2,1\r\n")))
        << matrix.LastError();
    EXPECT_EQ(matrix.Alphabet(), "ARN");
    EXPECT_EQ(matrix.Scores(), (std::vector<int>{1, 0, 0, 7, -7, 7, 3, 2, 1}));
    EXPECT_TRUE(matrix.IsValid());
}

TEST(ScoreMatrixText, FailuresKeepThePreviousMatrix) {
    TempDir dir;
    const CScoreMatrix before("blosum62mt");
    const std::vector<std::string> bad = {
        "# no header at all\n1 2 3\n",        // no header line
        "  A  R\nA 4 -1\nR -1 5 7\n",         // too many values in a row
        "  A  R\nA 4 99999999999\nR -1 5\n",  // score beyond 32 bits
        "  A  R\nA 4\nR -1 5\n",              // too few values in a row
        " " + std::string(300, 'A') + "\n",   // more letters than codes
        "",                                   // empty file
    };
    for (const std::string& text : bad) {
        CScoreMatrix matrix = before;
        matrix.Statistics().Set(4, 0.5, 0.5, false);
        EXPECT_FALSE(matrix.ReadTextFile(dir.File("bad.txt", text.empty() ? "\n" : text))) << text;
        EXPECT_FALSE(matrix.LastError().empty());
        EXPECT_TRUE(matrix.Equals(before)) << text;
        EXPECT_EQ(matrix.Statistics().Count(), 1u);
    }
    CScoreMatrix matrix = before;
    EXPECT_FALSE(matrix.ReadTextFile(dir.File("missing.txt")));
    EXPECT_NE(matrix.LastError().find("missing.txt"), std::string::npos);
    EXPECT_TRUE(matrix.Equals(before));
    EXPECT_FALSE(matrix.WriteTextFile(dir.File("no/such/folder/out.txt")));
}

TEST(ScoreMatrixText, StatisticsLinesAfterTheRows) {
    CScoreMatrix matrix;
    ASSERT_TRUE(
        matrix.ReadText(" A\nA 1\n\t3\t0.2500\t0.0500\t*\n"
                        "5 0.1 0.2\n5,0.3,0.4\n"  // the later line for m 5 wins
                        "7 0.5 0.25 x extra\n",   // no mark; further tokens ignored
                        "stats"))
        << matrix.LastError();
    double lambda = 0;
    double k = 0;
    ASSERT_EQ(matrix.Statistics().Count(), 3u);
    ASSERT_TRUE(matrix.Statistics().Lookup(3, lambda, k));
    EXPECT_EQ(lambda, 0.25);
    EXPECT_EQ(k, 0.05);
    EXPECT_NE(matrix.Statistics().Entries()[0]->marked, 0);
    ASSERT_TRUE(matrix.Statistics().Lookup(5, lambda, k));
    EXPECT_EQ(lambda, 0.3);
    EXPECT_EQ(k, 0.4);
    EXPECT_EQ(matrix.Statistics().Entries()[1]->sequences, 5);
    EXPECT_EQ(matrix.Statistics().Entries()[2]->marked, 0);

    // A new read replaces the statistics.
    ASSERT_TRUE(matrix.ReadText(" A\nA 1\n", "plain"));
    EXPECT_TRUE(matrix.Statistics().IsEmpty());
}

TEST(ScoreMatrixArchive, RoundTripKeepsEverythingStored) {
    CScoreMatrix matrix("pam120mt");
    matrix.SetComment("not stored");
    matrix.SetFrequencies(CFreqSet({1.0}, "A"));
    matrix.Statistics().Set(4, 0.7, 0.02, true);
    matrix.Statistics().SetReference("own reference");
    const std::vector<std::uint8_t> bytes = Store(matrix);

    CScoreMatrix read;
    Load(bytes, read);
    EXPECT_TRUE(read.Equals(matrix));
    EXPECT_EQ(read.Type(), kProteinType);
    EXPECT_EQ(read.Comment(), "");
    EXPECT_EQ(read.Frequencies(), CFreqSet());
    EXPECT_EQ(read.Statistics().Reference(), "own reference");
    double lambda = 0;
    double k = 0;
    ASSERT_TRUE(read.Statistics().Lookup(4, lambda, k));
    EXPECT_EQ(lambda, 0.7);
    EXPECT_EQ(k, 0.02);
}

// A matrix record as older files hold it: name, alphabet and scores only. (Outside the
// anonymous namespace: clang flags an unused class tag there.)
struct OldMatrixRecord : CSerializable {
    TB_CLASS_TAG("ScoreMatrix")
    void Serialize(CArchive& ar) override {
        std::string name = "old";
        std::string alphabet = "AR";
        ar.XMember(name);
        ar.XMember(alphabet);
        for (std::int32_t score : {1, 2, 3, 4})
            ar.XMember(score);
    }
};

TEST(ScoreMatrixArchive, OlderRecordsReadWithoutTypeAndStatistics) {
    OldMatrixRecord old;
    CArchive ar = CArchive::ForWriting();
    ar.XData(old);
    CScoreMatrix read("blosum62mt");
    read.Statistics().Set(2, 1, 1, false);
    Load(ar.Bytes(), read);
    EXPECT_EQ(read.Name(), "old");
    EXPECT_EQ(read.Scores(), (std::vector<int>{1, 2, 3, 4}));
    EXPECT_EQ(read.Type(), kNoSequenceType);
    EXPECT_TRUE(read.Statistics().IsEmpty());
}

TEST(ScoreMatrixArchive, DamagedRecordsAreRefusedAndLeaveTheMatrix) {
    CScoreMatrix matrix("blosum62mt");
    matrix.Statistics().Set(3, 0.25, 0.05, true);
    const std::vector<std::uint8_t> bytes = Store(matrix);
    const CScoreMatrix before("idmat");

    for (std::size_t length = 0; length < bytes.size(); ++length) {
        CScoreMatrix read = before;
        const std::vector<std::uint8_t> cut(bytes.begin(), bytes.begin() + length);
        EXPECT_THROW(Load(cut, read), CArchiveException) << length;
        EXPECT_TRUE(read.Equals(before)) << length;
    }

    std::mt19937 random(7);
    for (int trial = 0; trial < 2000; ++trial) {
        std::vector<std::uint8_t> flipped = bytes;
        flipped[random() % flipped.size()] ^= static_cast<std::uint8_t>(1u << (random() % 8));
        CScoreMatrix read = before;
        try {
            Load(flipped, read);
            // A flip inside a value reads as some other value; the table stays consistent.
            EXPECT_EQ(read.Scores().size(), read.Alphabet().size() * read.Alphabet().size());
        } catch (const CArchiveException&) {
            EXPECT_TRUE(read.Equals(before));
        }
    }
}

// A matrix record whose alphabet would make a table of 10^10 cells.
struct OverlongMatrixRecord : CSerializable {
    TB_CLASS_TAG("ScoreMatrix")
    void Serialize(CArchive& ar) override {
        std::string name = "huge";
        std::string alphabet(100000, 'A');
        ar.XMember(name);
        ar.XMember(alphabet);
    }
};

TEST(ScoreMatrixArchive, OverlongAlphabetIsAFormatError) {
    OverlongMatrixRecord huge;
    CArchive ar = CArchive::ForWriting();
    ar.XData(huge);
    CScoreMatrix read;
    EXPECT_THROW(Load(ar.Bytes(), read), CArchiveException);
}
