// The block table writer: its numbers against printf, its rows against a straightforward
// printf-based formatter over a searched (and then edited) block set, and the program's streams
// and statuses when it ends without tearing its result down.

#include <gtest/gtest.h>

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <limits>
#include <nlohmann/json.hpp>
#include <random>
#include <sstream>

#include "BlockProject.h"
#include "BlockSignificance.h"
#include "BlockTable.h"
#include "ScoreMatrix.h"
#include "SimBlockSet.h"
#include "archive/FileIO.h"
#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

const std::string kGlobins = TB_TEST_DATA_DIR "/../../resources/examples/globins.fa";

std::string Printf(const char* format, int precision, double value) {
    char text[512];
    std::snprintf(text, sizeof text, format, precision, value);
    return text;
}

std::string Fixed(double value, int precision) {
    std::string text = "<";  // appending keeps what was there
    AppendFixed(text, value, precision);
    return text;
}

std::string Scientific(double value, int precision) {
    std::string text = "<";
    AppendScientific(text, value, precision);
    return text;
}

// Whether two long texts are equal; on a difference, where it starts (gtest's own line diff of
// texts this long would need gigabytes).
::testing::AssertionResult SameText(const std::string& actual, const std::string& expected) {
    if (actual == expected)
        return ::testing::AssertionSuccess();
    const auto [a, e] =
        std::mismatch(actual.begin(), actual.end(), expected.begin(), expected.end());
    const std::size_t at = static_cast<std::size_t>(a - actual.begin());
    return ::testing::AssertionFailure()
           << actual.size() << " instead of " << expected.size()
           << " characters, first differing at " << at << ": \"" << actual.substr(at, 40)
           << "\" instead of \"" << expected.substr(at, 40) << "\"";
}

// Whether both writers agree with printf for `value` at the table's precisions and a few more.
::testing::AssertionResult WritesAsPrintf(double value) {
    for (int precision : {0, 1, 2, 3, 6}) {
        for (const bool fixed : {true, false}) {
            const std::string written =
                fixed ? Fixed(value, precision) : Scientific(value, precision);
            const std::string printed = "<" + Printf(fixed ? "%.*f" : "%.*e", precision, value);
            if (written != printed) {
                return ::testing::AssertionFailure()
                       << std::hexfloat << value << " at precision " << precision << ": " << written
                       << " instead of " << printed;
            }
        }
    }
    return ::testing::AssertionSuccess();
}

TEST(BlockTableNumbers, BoundariesAndSpecialValuesMatchPrintf) {
    const double inf = std::numeric_limits<double>::infinity();
    const double nan = std::numeric_limits<double>::quiet_NaN();
    for (double value : {0.0,     -0.0,      1.0,     -1.0,    0.5,      -0.5,
                         9.95,    99.95,     999.95,  -0.04,   -0.05,    1e-300,
                         -1e-300, 4.9e-324,  DBL_MIN, DBL_MAX, -DBL_MAX, 1.0 - DBL_EPSILON,
                         9.9995,  9.9994999, 1.0625,  2.5e-5,  1e22,     1e23,
                         inf,     -inf,      nan,     -nan}) {
        ASSERT_TRUE(WritesAsPrintf(value));
    }
}

// Exact binary halves are where round-half-even and round-half-up disagree; decimal "halves"
// such as 0.05 lie just above or below the tie and must round the way their true value does.
TEST(BlockTableNumbers, TiesAndNearTiesMatchPrintf) {
    for (int k = -4000; k <= 4000; ++k) {
        ASSERT_TRUE(WritesAsPrintf(k / 4.0));     // x.25, x.5, x.75: ties at one decimal
        ASSERT_TRUE(WritesAsPrintf(k / 16.0));    // ties at three significant digits too
        ASSERT_TRUE(WritesAsPrintf(k / 20.0));    // 0.05, 0.15 ...
        ASSERT_TRUE(WritesAsPrintf(k / 2000.0));  // 0.0005, 0.0015 ...
        ASSERT_TRUE(WritesAsPrintf(k * 1.0005));
    }
}

TEST(BlockTableNumbers, RandomValuesOfEveryMagnitudeMatchPrintf) {
    std::mt19937_64 random(20240611);
    std::uniform_real_distribution<double> exponent(-320.0, 308.0);
    for (int i = 0; i < 20000; ++i) {
        const double value = std::pow(10.0, exponent(random));
        ASSERT_TRUE(WritesAsPrintf(i % 2 ? value : -value));
    }
    // Any bit pattern: subnormals, NaNs with payloads, infinities.
    for (int i = 0; i < 20000; ++i) {
        const std::uint64_t bits = random();
        double value;
        std::memcpy(&value, &bits, sizeof value);
        ASSERT_TRUE(WritesAsPrintf(value));
    }
    // MP-scores are score / (n(n-1)/2) and P values are mostly tiny: those quotients exactly.
    std::uniform_int_distribution<int> score(-5000, 50000);
    for (int n = 2; n <= 64; ++n) {
        for (int i = 0; i < 100; ++i)
            ASSERT_TRUE(WritesAsPrintf(score(random) / (n * (n - 1) / 2.0)));
    }
}

// The row as the table states it, written with printf and streams field by field.
std::string ReferenceRow(const CSimBlockSet& set, int index, const CScoreMatrix& matrix,
                         double expectationLimit) {
    const CSimBlock::Layout layout = CSimBlock::kCurrent;
    const CSimBlock& block = *set.BlockAt(index);
    const CBlockSignificance significance =
        EvaluateBlockSignificance(block, &set, matrix, expectationLimit, layout);
    char mp[64];
    char p[64];
    std::snprintf(mp, sizeof mp, "%.1f", block.MeanPairScore(layout));
    std::snprintf(p, sizeof p, "%.3e", significance.p);
    const char* word = significance.state == kSignificant      ? "yes"
                       : significance.state == kNotSignificant ? "no"
                                                               : "n/a";
    std::ostringstream row;
    row << index + 1 << '\t' << block.Name() << '\t' << block.SequenceCount(layout) << '\t'
        << block.Width(layout) << '\t' << mp << '\t' << block.Score(layout) << '\t' << word << '\t'
        << p << '\t' << block.LowestStart(layout) + 1 << '\t';
    const char* separator = "";
    for (int i = 0; i < block.MemberCount(); ++i) {
        if (!block.IsIncluded(i))
            continue;
        const CSxMolEntry* entry = set.MoleculeAt(block.Member(i));
        row << separator << (entry ? entry->Name() : "?") << ':' << block.Start(layout, i) + 1;
        separator = ",";
    }
    return row.str();
}

// A search over the globins, its project taken from what the command hands back to main.
class BlockTableOfSearch : public ::testing::Test {
  protected:
    void SetUp() override {
        std::ostringstream out;
        std::ostringstream err;
        CCliContext context{out, err};
        ASSERT_EQ(RunCli({"search", "--quiet", kGlobins}, context), 0) << err.str();
        ASSERT_EQ(context.keepAlive.size(), 1u);
        m_project = std::static_pointer_cast<CBlockProject>(context.keepAlive.front());
        m_printed = out.str();
        ASSERT_GT(Set().BlockCount(), 10);
    }

    CSimBlockSet& Set() { return m_project->BlockSet(); }
    const CScoreMatrix& Matrix() const { return m_project->Params().Matrix(); }
    double Limit() const { return m_project->Params().ExpectationLimit(); }

    std::string Table() {
        std::ostringstream out;
        WriteBlockTable(out, Set(), Matrix(), Limit());
        return out.str();
    }

    void ExpectReferenceRows(const CScoreMatrix& matrix) {
        for (int b = 0; b < Set().BlockCount(); ++b) {
            EXPECT_EQ(BlockTableRow(Set(), b, matrix, Limit()),
                      ReferenceRow(Set(), b, matrix, Limit()))
                << "block " << b + 1;
        }
    }

    std::shared_ptr<CBlockProject> m_project;
    std::string m_printed;
};

TEST_F(BlockTableOfSearch, TableIsTheHeaderAndEveryRowAsPrinted) {
    std::string expected = std::string(kBlockTableHeader) + "\n";
    for (int b = 0; b < Set().BlockCount(); ++b)
        expected += ReferenceRow(Set(), b, Matrix(), Limit()) + "\n";
    EXPECT_TRUE(SameText(Table(), expected));
    EXPECT_TRUE(SameText(m_printed, expected));
    // Larger than one chunk, so the pieces are joined without loss or repetition.
    EXPECT_GT(expected.size(), 128u * 1024u);
}

TEST_F(BlockTableOfSearch, EditedLayoutsNamesAndMissingEntriesFormatLikeTheReference) {
    CSimBlock& named = *Set().BlockAt(0);
    named.SetName("kinase domain");
    named.SetIncluded(0, false);
    named.SetIncluded(named.MemberCount() - 1, false);
    CSimBlock& emptied = *Set().BlockAt(1);
    for (int i = 0; i < emptied.MemberCount(); ++i)
        emptied.SetIncluded(i, false);
    CSimBlock& shifted = *Set().BlockAt(2);
    shifted.SetCurrentStart(1, shifted.Start(CSimBlock::kCurrent, 1) + 3);
    shifted.SetCurrentScore(-17);

    auto orphan = std::make_unique<CSimBlock>();
    const std::vector<std::int32_t> members = {0, 1, Set().MoleculeCount() + 5};
    const std::vector<std::int32_t> starts = {4, 0, 9};
    orphan->Init(members, starts, 6, 1000000, 0);
    const int orphanIndex = Set().AddBlockSorted(std::move(orphan));
    ASSERT_GT(orphanIndex, 2);  // fewer members than any found block: it goes last

    ExpectReferenceRows(Matrix());
    const std::string orphanRow = BlockTableRow(Set(), orphanIndex, Matrix(), Limit());
    EXPECT_NE(orphanRow.find(",?:10"), std::string::npos) << orphanRow;
    const std::string emptiedRow = BlockTableRow(Set(), 1, Matrix(), Limit());
    EXPECT_EQ(emptiedRow.substr(emptiedRow.size() - 3), "\t0\t") << emptiedRow;

    // JSON lists the same included members.
    for (int b : {0, 1, 2, orphanIndex}) {
        const nlohmann::json json = BlockJson(Set(), b, Matrix(), Limit());
        std::string joined;
        for (const nlohmann::json& member : json["members"]) {
            joined += (joined.empty() ? "" : ",") + member["name"].get<std::string>() + ":" +
                      std::to_string(member["start"].get<int>());
        }
        const std::string row = BlockTableRow(Set(), b, Matrix(), Limit());
        EXPECT_EQ(row.substr(row.rfind('\t') + 1), joined) << "block " << b + 1;
    }
}

// The streamed array against the whole document built and dumped at once, at the top level,
// nested, and with no blocks at all.
TEST_F(BlockTableOfSearch, StreamedJsonIsTheDumpOfTheWholeDocument) {
    nlohmann::json blocks = nlohmann::json::array();
    for (int b = 0; b < Set().BlockCount(); ++b)
        blocks.push_back(BlockJson(Set(), b, Matrix(), Limit()));
    auto streamed = [&](int depth) {
        std::ostringstream out;
        WriteBlocksJson(out, Set(), Matrix(), Limit(), depth);
        return out.str();
    };
    EXPECT_TRUE(SameText(streamed(0), blocks.dump(2)));
    const nlohmann::json nested = {{"result", {{"blocks", blocks}}}};
    EXPECT_TRUE(SameText("{\n  \"result\": {\n    \"blocks\": " + streamed(2) + "\n  }\n}",
                         nested.dump(2)));
    EXPECT_EQ(nlohmann::json::parse(streamed(3)), blocks);

    Set().ClearBlocks();
    EXPECT_EQ(streamed(0), nlohmann::json::array().dump(2));
    EXPECT_EQ(streamed(1), nlohmann::json::array().dump(2));
}

// With a matrix that has statistics, P values vary over many magnitudes and blocks are judged
// significant or not.
TEST_F(BlockTableOfSearch, SignificanceAndSmallPValuesFormatLikeTheReference) {
    const fs::path dir = fs::temp_directory_path() / ("tb_block_table_" + std::to_string(getpid()));
    fs::create_directories(dir);
    std::ifstream source(TB_TEST_DATA_DIR "/matrices/blosum62mt.txt");
    std::stringstream text;
    text << source.rdbuf() << "\n#\tm\tlambda\tK\n";
    for (int m = 2; m <= 16; ++m)
        text << "\t" << m << "\t" << 0.013 * m << "\t0.1000\n";
    const std::string path = (dir / "stat.txt").string();
    std::ofstream(path) << text.str();
    CScoreMatrix matrix;
    const bool loaded = matrix.LoadBuiltinOrFile(path);
    fs::remove_all(dir);
    ASSERT_TRUE(loaded) << matrix.LastError();

    ExpectReferenceRows(matrix);
    bool sawYes = false;
    bool sawNo = false;
    for (int b = 0; b < Set().BlockCount(); ++b) {
        const std::string row = BlockTableRow(Set(), b, matrix, Limit());
        sawYes = sawYes || row.find("\tyes\t") != std::string::npos;
        sawNo = sawNo || row.find("\tno\t") != std::string::npos;
    }
    EXPECT_TRUE(sawYes);
    EXPECT_TRUE(sawNo);
}

struct CProcessRun {
    int status;
    std::string out;
    std::string err;
};

// The built program with its streams sent to files.
CProcessRun RunProgram(const std::string& args) {
    const fs::path dir = fs::temp_directory_path() / ("tb_block_table_" + std::to_string(getpid()));
    fs::create_directories(dir);
    const std::string command = std::string(TB_CLI_PATH) + " " + args + " > '" +
                                (dir / "out").string() + "' 2> '" + (dir / "err").string() + "'";
    const int status = std::system(command.c_str());
    const std::vector<std::uint8_t> out = ReadWholeFile((dir / "out").string());
    const std::vector<std::uint8_t> err = ReadWholeFile((dir / "err").string());
    fs::remove_all(dir);
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, std::string(out.begin(), out.end()),
            std::string(err.begin(), err.end())};
}

// The program ends without destructors: everything it wrote must still arrive, with its status.
TEST(BlockTableProgram, EveryStreamIsCompleteAndStatusesAreKept) {
    // Quiet: no later write to stderr flushes stdout on the way.
    const CProcessRun json = RunProgram("search --quiet --format json '" + kGlobins + "'");
    EXPECT_EQ(json.status, 0);
    EXPECT_TRUE(
        SameText(json.out, RunTool({"search", "--quiet", "--format", "json", kGlobins}).out));
    EXPECT_EQ(json.err, "");

    const fs::path dir =
        fs::temp_directory_path() / ("tb_block_table_one_" + std::to_string(getpid()));
    fs::create_directories(dir);
    std::ofstream(dir / "one.fa") << ">a\nMKVLWWWCAGHY\n";
    const CProcessRun failed = RunProgram("search '" + (dir / "one.fa").string() + "'");
    const CRun inProcess = RunTool({"search", (dir / "one.fa").string()});
    fs::remove_all(dir);
    EXPECT_EQ(failed.status, 1);
    EXPECT_EQ(failed.out, "");
    EXPECT_EQ(failed.err, inProcess.err);
    EXPECT_NE(failed.err.find("at least 2 molecules"), std::string::npos) << failed.err;

    const CProcessRun usage = RunProgram("search --threads 0 '" + kGlobins + "'");
    EXPECT_EQ(usage.status, 2);
    EXPECT_NE(usage.err.find("--threads"), std::string::npos) << usage.err;
}

TEST(BlockTableProgram, OutputThatCannotBeWrittenIsAFailure) {
    if (!fs::exists("/dev/full"))
        GTEST_SKIP() << "no /dev/full here";
    const std::string command =
        std::string(TB_CLI_PATH) + " search --quiet '" + kGlobins + "' > /dev/full 2> /dev/null";
    const int status = std::system(command.c_str());
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 2);
}

}  // namespace
