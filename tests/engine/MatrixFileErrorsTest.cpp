// Damaged matrix text files are refused, naming the line, instead of being read with zeros;
// the statistics section reads in one pass however long it is.

#include <gtest/gtest.h>

#include <map>
#include <random>

#include "ScoreMatrix.h"

namespace {

struct CRefusal {
    const char* what;
    std::string text;
    std::string error;
};

// A three-letter matrix file with a comment line and a blank line before the header (line 3),
// so that the rows are on lines 4 to 6.
std::string ThreeLetters(const std::string& rowA, const std::string& rowR, const std::string& rowN,
                         const std::string& after = {}) {
    return "# made by hand\n\n   A  R  N\n" + rowA + "\n" + rowR + "\n" + rowN + "\n" + after;
}

TEST(MatrixFileErrors, DamagedRowsAreRefusedNamingTheLine) {
    const std::string a = "A  4 -1 -2";
    const std::string r = "R -1  5  0";
    const std::string n = "N -2  0  6";
    const std::vector<CRefusal> cases = {
        {"short row", ThreeLetters(a, "R -1 5", n), "line 5: row R has 2 values, 3 expected"},
        {"long row", ThreeLetters(a, r, "N -2 0 6 1"), "line 6: row N has 4 values, 3 expected"},
        {"missing row", ThreeLetters(a, n, ""), "line 5: row R expected, found \"N -2  0  6\""},
        {"rows out of order", ThreeLetters(r, a, n),
         "line 4: row A expected, found \"R -1  5  0\""},
        {"label glued to a value", ThreeLetters("A4 -1 -2", r, n),
         "line 4: row A expected, found \"A4 -1 -2\""},
        {"letter for a score", ThreeLetters(a, "R -1 x 0", n),
         "line 5: \"x\" in row R is not a whole number"},
        {"decimal score", ThreeLetters(a, r, "N -2 0 6.5"),
         "line 6: \"6.5\" in row N is not a whole number"},
        {"digits then letters", ThreeLetters("A 4 -1 -2ab", r, n),
         "line 4: \"-2ab\" in row A is not a whole number"},
        {"score beyond 32 bits", ThreeLetters(a, r, "N -2 0 99999999999"),
         "line 6: \"99999999999\" in row N is beyond 32 bits"},
        {"a comment inside a row", ThreeLetters(a, "R -1 5 0 # note", n),
         "line 6: row R expected, found \"N -2  0  6\""},
    };
    for (const CRefusal& refusal : cases) {
        CScoreMatrix matrix("blosum62mt");
        EXPECT_FALSE(matrix.ReadText(refusal.text, "bad")) << refusal.what;
        EXPECT_EQ(matrix.LastError(), refusal.error) << refusal.what;
        EXPECT_EQ(matrix.Name(), "blosum62mt") << refusal.what;  // the matrix stays as it was
    }
    CScoreMatrix good;
    ASSERT_TRUE(good.ReadText(ThreeLetters(a, r, n), "good")) << good.LastError();
    EXPECT_EQ(good.Scores(), (std::vector<int>{4, -1, -2, -1, 5, 0, -2, 0, 6}));
}

TEST(MatrixFileErrors, TruncatedFilesAreRefused) {
    const std::vector<CRefusal> cases = {
        {"header only", "   A  R\n", "the file ends at line 1 before row A (row 1 of 2)"},
        {"last row missing", "# x\n   A  R\nA 4 -1\n\n",
         "the file ends at line 3 before row R (row 2 of 2)"},
        {"cut inside a row", "   A  R\nA 4 -1\nR -1", "line 3: row R has 1 values, 2 expected"},
        {"cut inside a statistics line", "   A\nA 4\n\t3\t0.25",
         "line 3: a statistics line needs the number of sequences, lambda and K"},
    };
    for (const CRefusal& refusal : cases) {
        CScoreMatrix matrix;
        EXPECT_FALSE(matrix.ReadText(refusal.text, "cut")) << refusal.what;
        EXPECT_EQ(matrix.LastError(), refusal.error) << refusal.what;
        EXPECT_FALSE(matrix.IsValid());
    }
}

TEST(MatrixFileErrors, DamagedStatisticsLinesAreRefused) {
    const std::string rows = "   A\r\nA 4\r\n";  // CR LF line ends count one line each
    const std::vector<CRefusal> cases = {
        {"letters for m", rows + "x 0.25 0.05\r\n",
         "line 3: the number of sequences \"x\" is not a whole number from 1 to 2147483647"},
        {"decimal m", rows + "2.5 0.25 0.05\r\n",
         "line 3: the number of sequences \"2.5\" is not a whole number from 1 to 2147483647"},
        {"m of 0", rows + "\t3\t0.25\t0.05\r\n0 0.25 0.05\r\n",
         "line 4: the number of sequences \"0\" is not a whole number from 1 to 2147483647"},
        {"letters for lambda", rows + "3 abc 0.05\r\n",
         "line 3: lambda \"abc\" is not a number of 0 or more"},
        {"negative K", rows + "3 0.25 -0.05\r\n",
         "line 3: K \"-0.05\" is not a number of 0 or more"},
        {"infinite K", rows + "3 0.25 inf\r\n", "line 3: K \"inf\" is not a number of 0 or more"},
        {"not a number", rows + "3 nan 0.05\r\n",
         "line 3: lambda \"nan\" is not a number of 0 or more"},
        {"trailing text", rows + "3 0.25 0.05\r\nend\r\n",
         "line 4: a statistics line needs the number of sequences, lambda and K"},
    };
    for (const CRefusal& refusal : cases) {
        CScoreMatrix matrix;
        EXPECT_FALSE(matrix.ReadText(refusal.text, "stats")) << refusal.what;
        EXPECT_EQ(matrix.LastError(), refusal.error) << refusal.what;
    }
    // Signs, exponents, commas and a mark with more text after it are all fine.
    CScoreMatrix matrix;
    ASSERT_TRUE(matrix.ReadText(rows + "+3,2.5e-1,+0.05,*,note\r\n", "stats"))
        << matrix.LastError();
    ASSERT_EQ(matrix.Statistics().Count(), 1u);
    const CStatConst& entry = *matrix.Statistics().Entries()[0];
    EXPECT_EQ(entry.sequences, 3);
    EXPECT_EQ(entry.lambda, 0.25);
    EXPECT_EQ(entry.k, 0.05);
    EXPECT_NE(entry.marked, 0);
}

TEST(MatrixFileErrors, DefaultCutoffBelowOneIsRefused) {
    CScoreMatrix matrix("blosum62mt");
    // Largest score 0 on and below the diagonal: the default cutoff would be 0.
    EXPECT_FALSE(matrix.ReadText("  A R\nA 0 5\nR -1 -3\n", "flat"));
    EXPECT_EQ(matrix.LastError(),
              "the default cutoff, 3 times the largest score 0, is 0; a cutoff must be at least 1");
    EXPECT_FALSE(matrix.ReadText("  A\nA -2\n", "negative"));
    EXPECT_EQ(matrix.LastError(),
              "the default cutoff, 3 times the largest score -2, is -6; a cutoff must be at least "
              "1");
    EXPECT_FALSE(matrix.ReadText("  A\nA 1000000000\n", "huge"));
    EXPECT_EQ(matrix.LastError(),
              "the default cutoff, 3 times the largest score 1000000000, is 3000000000, beyond 32 "
              "bits");
    EXPECT_EQ(matrix.Name(), "blosum62mt");
    // One positive score is enough.
    ASSERT_TRUE(matrix.ReadText("  A R\nA 0 -1\nR -1 1\n", "one"));
    EXPECT_EQ(matrix.DefaultCutoff(), 3);
}

TEST(MatrixFileErrors, LargeStatisticsSectionReadsEveryLine) {
    // 200,000 lines over 150,000 numbers of sequences in random order: a later line for the
    // same number replaces the earlier entry where it stands.
    std::mt19937 random(11);
    std::string text = "   A\nA 4\n";
    std::vector<int> order;                    // numbers in order of first appearance
    std::map<int, std::pair<int, bool>> last;  // number -> last lambda index, mark
    for (int i = 0; i < 200000; ++i) {
        const int m = 1 + static_cast<int>(random() % 150000);
        const bool marked = random() % 2 == 0;
        if (!last.count(m))
            order.push_back(m);
        last[m] = {i, marked};
        text += "\t" + std::to_string(m) + "\t" + std::to_string(i) + ".5\t0.25" +
                (marked ? "\t*" : "") + "\n";
    }
    CScoreMatrix matrix;
    ASSERT_TRUE(matrix.ReadText(text, "large")) << matrix.LastError();
    const CStatSerialArray& entries = matrix.Statistics().Entries();
    ASSERT_EQ(entries.size(), order.size());
    for (std::size_t i = 0; i < order.size(); ++i) {
        ASSERT_EQ(entries[i]->sequences, order[i]) << i;
        ASSERT_EQ(entries[i]->lambda, last[order[i]].first + 0.5) << i;
        ASSERT_EQ(entries[i]->marked != 0, last[order[i]].second) << i;
    }
    // A copy of the matrix keeps them all, in the same order.
    const CScoreMatrix copy = matrix;
    ASSERT_EQ(copy.Statistics().Count(), order.size());
    EXPECT_EQ(copy.Statistics().Entries().back()->sequences, order.back());
}

}  // namespace
