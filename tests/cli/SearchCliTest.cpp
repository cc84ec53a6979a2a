// tiler-blocks-cli search: the block table checked against the sequences themselves, the JSON
// form, significance from a matrix file's statistics, the files it writes and its exit statuses.

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <map>
#include <nlohmann/json.hpp>
#include <regex>
#include <sstream>

#include "QuilterParams.h"
#include "ScoreMatrix.h"
#include "TextLines.h"
#include "archive/FileIO.h"
#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

const std::string kGlobins = TB_TEST_DATA_DIR "/../../resources/examples/globins.fa";

std::vector<std::string> Split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::string part;
    std::istringstream in(text);
    while (std::getline(in, part, separator))
        parts.push_back(part);
    if (!text.empty() && text.back() == separator)
        parts.push_back("");
    return parts;
}

// Name -> sequence of a FASTA file (the first word of the title line).
std::map<std::string, std::string> ReadFasta(const std::string& path) {
    std::map<std::string, std::string> sequences;
    std::ifstream in(path);
    std::string name;
    for (std::string line; std::getline(in, line);) {
        if (!line.empty() && line.back() == '\r')
            line.pop_back();
        if (!line.empty() && line[0] == '>') {
            name = line.substr(1, line.find_first_of(" \t") - 1);
            continue;
        }
        for (char c : line) {
            if (std::isalpha(static_cast<unsigned char>(c)))
                sequences[name] += c;
        }
    }
    return sequences;
}

class CTempDir {
  public:
    CTempDir() {
        char pattern[] = "/tmp/tb_search_cli_XXXXXX";
        m_path = ::mkdtemp(pattern);
    }
    ~CTempDir() { fs::remove_all(m_path); }
    std::string operator/(const std::string& name) const {
        return (fs::path(m_path) / name).string();
    }

  private:
    std::string m_path;
};

void WriteText(const std::string& path, const std::string& text) {
    std::ofstream(path) << text;
}

struct CRow {
    int index;
    int m;
    int width;
    std::string mpScore;
    long spScore;
    std::string significance;
    std::string p;
    int offset;
    std::vector<std::pair<std::string, int>> members;
};

std::vector<CRow> ParseTable(const std::string& out) {
    const std::vector<std::string> lines = Lines(out);
    EXPECT_EQ(lines.at(0), "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers");
    std::vector<CRow> rows;
    for (std::size_t i = 1; i < lines.size(); ++i) {
        const std::vector<std::string> fields = Split(lines[i], '\t');
        EXPECT_EQ(fields.size(), 10u) << lines[i];
        CRow row{std::stoi(fields[0]),
                 std::stoi(fields[2]),
                 std::stoi(fields[3]),
                 fields[4],
                 std::stol(fields[5]),
                 fields[6],
                 fields[7],
                 std::stoi(fields[8]),
                 {}};
        EXPECT_EQ(fields[1], "");  // blocks of a search have no name
        for (const std::string& member : Split(fields[9], ',')) {
            const std::size_t colon = member.rfind(':');
            row.members.emplace_back(member.substr(0, colon), std::stoi(member.substr(colon + 1)));
        }
        rows.push_back(row);
    }
    return rows;
}

// The sum-of-pairs score of a row, from the sequence texts.
long PairScore(const CRow& row, const std::map<std::string, std::string>& sequences,
               const CScoreMatrix& matrix) {
    std::vector<std::vector<std::uint8_t>> codes;
    for (const auto& [name, start] : row.members) {
        std::vector<std::uint8_t> encoded;
        EXPECT_TRUE(matrix.Encode(sequences.at(name).substr(start - 1, row.width), encoded));
        EXPECT_EQ(static_cast<int>(encoded.size()), row.width) << name;
        codes.push_back(encoded);
    }
    long score = 0;
    for (std::size_t u = 0; u < codes.size(); ++u) {
        for (std::size_t v = u + 1; v < codes.size(); ++v) {
            for (int c = 0; c < row.width; ++c)
                score += matrix.Score(codes[u][c], codes[v][c]);
        }
    }
    return score;
}

std::string Format(const char* format, double value) {
    char text[64];
    std::snprintf(text, sizeof text, format, value);
    return text;
}

TEST(SearchCli, BlockTableDescribesBlocksOfTheSequencesInBlockOrder) {
    const CRun run = RunTool({"search", kGlobins});
    ASSERT_EQ(run.status, 0) << run.err;
    const std::vector<CRow> rows = ParseTable(run.out);
    ASSERT_GT(rows.size(), 5u);
    const auto sequences = ReadFasta(kGlobins);
    const CScoreMatrix blosum("blosum62mt");
    for (std::size_t i = 0; i < rows.size(); ++i) {
        const CRow& row = rows[i];
        EXPECT_EQ(row.index, static_cast<int>(i) + 1);
        EXPECT_GE(row.m, 5);
        ASSERT_EQ(static_cast<int>(row.members.size()), row.m);
        EXPECT_GE(row.width, 2);
        EXPECT_EQ(row.spScore, PairScore(row, sequences, blosum)) << "block " << row.index;
        EXPECT_EQ(row.mpScore, Format("%.1f", row.spScore / (row.m * (row.m - 1) / 2.0)));
        EXPECT_EQ(row.significance, "n/a");
        EXPECT_EQ(row.p, "1.000e+00");
        int lowest = row.members[0].second;
        for (const auto& member : row.members)
            lowest = std::min(lowest, member.second);
        EXPECT_EQ(row.offset, lowest);
        if (i > 0) {  // more members first, then the higher score
            const CRow& before = rows[i - 1];
            EXPECT_TRUE(before.m > row.m || (before.m == row.m && before.spScore >= row.spScore));
        }
    }
    const std::regex summary(
        "hits: [0-9]+  diagonals: [0-9]+  blocks: " + std::to_string(rows.size()) + "\n$");
    EXPECT_TRUE(std::regex_search(run.err, summary)) << run.err;

    const CRun quiet = RunTool({"search", "--quiet", "--threads", "1", kGlobins});
    EXPECT_EQ(quiet.status, 0);
    EXPECT_EQ(quiet.out, run.out);
    EXPECT_EQ(quiet.err, "");
}

TEST(SearchCli, JsonHoldsTheSameBlocksAndTheParametersUsed) {
    const CRun tsv = RunTool({"search", "--quiet", kGlobins});
    const CRun json =
        RunTool({"search", "--quiet", "--format", "json", "--min-seqs", "7", kGlobins});
    ASSERT_EQ(json.status, 0) << json.err;
    const nlohmann::json result = nlohmann::json::parse(json.out);
    EXPECT_EQ(result["parameters"]["matrix"], "blosum62mt");
    EXPECT_EQ(result["parameters"]["cutoff"], 33);
    EXPECT_EQ(result["parameters"]["min_seqs"], 7);
    EXPECT_DOUBLE_EQ(result["parameters"]["evalue"].get<double>(), 0.0001);
    EXPECT_EQ(result["molecules"].size(), ReadFasta(kGlobins).size());
    // With a minimum of 7 the blocks are those of the default run that have at least 7 members.
    std::vector<CRow> expected;
    for (const CRow& row : ParseTable(tsv.out)) {
        if (row.m >= 7)
            expected.push_back(row);
    }
    const nlohmann::json& blocks = result["blocks"];
    ASSERT_EQ(blocks.size(), expected.size());
    for (std::size_t i = 0; i < expected.size(); ++i) {
        EXPECT_EQ(blocks[i]["block"], i + 1);
        EXPECT_EQ(blocks[i]["m"], expected[i].m);
        EXPECT_EQ(blocks[i]["sp_score"], expected[i].spScore);
        EXPECT_EQ(blocks[i]["significance"], "n/a");
        ASSERT_EQ(blocks[i]["members"].size(), expected[i].members.size());
        EXPECT_EQ(blocks[i]["members"][0]["name"], expected[i].members[0].first);
        EXPECT_EQ(blocks[i]["members"][0]["start"], expected[i].members[0].second);
    }
}

TEST(SearchCli, MatrixFileStatisticsGiveBlocksSignificanceAndP) {
    CTempDir dir;
    const std::string matrixPath = dir / "blosum62stat.txt";
    std::ifstream source(TB_TEST_DATA_DIR "/matrices/blosum62mt.txt");
    std::stringstream text;
    text << source.rdbuf() << "\n#\tm\tlambda\tK\n";
    for (int m = 2; m <= 16; ++m)
        text << "\t" << m << "\t" << 0.02 * m << "\t0.1000\n";
    WriteText(matrixPath, text.str());

    const CRun run =
        RunTool({"search", "--quiet", "--matrix", matrixPath, "--evalue", "1e-20", kGlobins});
    ASSERT_EQ(run.status, 0) << run.err;
    const std::vector<CRow> rows = ParseTable(run.out);
    ASSERT_FALSE(rows.empty());
    std::vector<double> lengths;
    for (const auto& [name, sequence] : ReadFasta(kGlobins))
        lengths.push_back(static_cast<double>(sequence.size()));
    int significant = 0;
    for (const CRow& row : rows) {
        // The sum over every choice of m lengths of their product.
        std::vector<double> sums(row.m + 1, 0.0);
        sums[0] = 1.0;
        for (double length : lengths) {
            for (int k = row.m; k >= 1; --k)
                sums[k] += length * sums[k - 1];
        }
        const int tabulated = std::min(row.m, 16);
        // 1 - exp(-x), kept exact for tiny x.
        const double p =
            -std::expm1(-0.1 * sums[row.m] * std::exp(-0.02 * tabulated * row.spScore));
        EXPECT_EQ(row.p, Format("%.3e", p)) << "block " << row.index;
        EXPECT_EQ(row.significance, p < 1e-20 ? "yes" : "no") << "block " << row.index;
        significant += row.significance == "yes";
    }
    EXPECT_GT(significant, 0);
    EXPECT_LT(significant, static_cast<int>(rows.size()));
}

TEST(SearchCli, SavedProjectAndAlignmentHoldTheSearch) {
    CTempDir dir;
    const CRun run = RunTool({"search", "--quiet", "--save", dir / "globins.bpr", "--msf",
                              dir / "globins.msf", kGlobins});
    ASSERT_EQ(run.status, 0) << run.err;
    const CRun info = RunTool({"info", dir / "globins.bpr"});
    ASSERT_EQ(info.status, 0) << info.err;
    // The info block section lists the same rows.
    const std::size_t blocks = info.out.find("# blocks\n");
    const std::size_t links = info.out.find("# links\n");
    ASSERT_NE(blocks, std::string::npos);
    EXPECT_EQ(info.out.substr(blocks + 9, links - blocks - 9), run.out);
    EXPECT_GT(fs::file_size(dir / "globins.msf"), 0u);
}

TEST(SearchCli, TemplateParametersYieldToExplicitOptions) {
    CTempDir dir;
    CQuilterParams params;
    params.SetMatrix(CScoreMatrix("blosum80mt"));
    params.SetMinSequences(9);
    const std::vector<std::uint8_t> bytes = params.TemplateBytes();
    WriteFileAtomically(dir / "strict.bp1", bytes);

    auto parameters = [&](std::vector<std::string> extra) {
        std::vector<std::string> args = {"search", "--quiet",    "--format",
                                         "json",   "--template", dir / "strict.bp1"};
        args.insert(args.end(), extra.begin(), extra.end());
        args.push_back(kGlobins);
        const CRun run = RunTool(args);
        EXPECT_EQ(run.status, 0) << run.err;
        return nlohmann::json::parse(run.out)["parameters"];
    };
    const nlohmann::json fromTemplate = parameters({});
    EXPECT_EQ(fromTemplate["matrix"], "blosum80mt");
    EXPECT_EQ(fromTemplate["cutoff"], 48);  // the template matrix's default cutoff
    EXPECT_EQ(fromTemplate["min_seqs"], 9);
    const nlohmann::json overridden = parameters({"--cutoff", "40", "--min-seqs", "6"});
    EXPECT_EQ(overridden["cutoff"], 40);
    EXPECT_EQ(overridden["min_seqs"], 6);
}

TEST(SearchCli, MinimumIsLoweredToTheNumberOfMolecules) {
    CTempDir dir;
    WriteText(dir / "three.fa", ">a\nMKVLWWWCAGHYKLM\n>b\nMKVLWWWCAGHYKLM\n>c\nMKVLWWWCAGHYKLM\n");
    const CRun run = RunTool({"search", "--quiet", "--format", "json", dir / "three.fa"});
    ASSERT_EQ(run.status, 0) << run.err;
    const nlohmann::json result = nlohmann::json::parse(run.out);
    EXPECT_EQ(result["parameters"]["min_seqs"], 3);
    ASSERT_EQ(result["blocks"].size(), 1u);
    EXPECT_EQ(result["blocks"][0]["m"], 3);
    EXPECT_EQ(result["blocks"][0]["len"], 15);
}

TEST(SearchCli, ExitStatusesSayWhatWentWrong) {
    CTempDir dir;
    WriteText(dir / "one.fa", ">a\nMKVLWWWCAGHY\n");
    const CRun single = RunTool({"search", dir / "one.fa"});
    EXPECT_EQ(single.status, 1);
    EXPECT_NE(single.err.find("at least 2 molecules"), std::string::npos) << single.err;

    std::string many;
    for (int i = 0; i < 65; ++i)
        many += ">m" + std::to_string(i) + "\nMKVLWWWCAGHY\n";
    WriteText(dir / "many.fa", many);
    const CRun tooMany = RunTool({"search", dir / "many.fa"});
    EXPECT_EQ(tooMany.status, 2);
    EXPECT_NE(tooMany.err.find("at most 64 molecules"), std::string::npos) << tooMany.err;
    EXPECT_EQ(tooMany.out, "");

    for (const std::vector<std::string>& args :
         std::vector<std::vector<std::string>>{{"search", dir / "missing.fa"},
                                               {"search", "--cutoff", "0", kGlobins},
                                               {"search", "--min-seqs", "1", kGlobins},
                                               {"search", "--format", "xml", kGlobins},
                                               {"search", "--matrix", "nosuchmatrix", kGlobins},
                                               {"search", "--raw", "rna", kGlobins},
                                               {"search"}}) {
        EXPECT_EQ(RunTool(args).status, 2) << args[1];
    }
}

// The installed program: its exit status and output streams as a shell sees them.
TEST(SearchCli, ProgramWritesTheTableToStdoutAndTheSummaryToStderr) {
    CTempDir dir;
    const std::string command = std::string(TB_CLI_PATH) + " search --threads 2 '" + kGlobins +
                                "' > '" + (dir / "out.tsv") + "' 2> '" + (dir / "err.txt") + "'";
    ASSERT_EQ(std::system(command.c_str()), 0);
    const std::vector<std::uint8_t> out = ReadWholeFile(dir / "out.tsv");
    const std::vector<std::uint8_t> err = ReadWholeFile(dir / "err.txt");
    EXPECT_EQ(std::string(out.begin(), out.end()), RunTool({"search", "--quiet", kGlobins}).out);
    EXPECT_EQ(std::string(err.begin(), err.end()).rfind("hits: ", 0), 0u);

    const std::string failing =
        std::string(TB_CLI_PATH) + " search --min-seqs 1 '" + kGlobins + "' > /dev/null 2>&1";
    const int status = std::system(failing.c_str());
    EXPECT_EQ(WEXITSTATUS(status), 2);
}

}  // namespace
