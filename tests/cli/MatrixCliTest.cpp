#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <sstream>

#include "cli/CliRun.h"
#include "engine/MatrixReference.h"

namespace fs = std::filesystem;

namespace {

CRun Matrix(std::vector<std::string> args) {
    args.insert(args.begin(), "matrix");
    return RunTool(args);
}

// "key: value" lines as a map.
std::map<std::string, std::string> InfoOf(const std::string& text) {
    std::map<std::string, std::string> info;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        const std::size_t colon = line.find(": ");
        if (colon != std::string::npos)
            info[line.substr(0, colon)] = line.substr(colon + 2);
    }
    return info;
}

std::string ReadText(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream text;
    text << in.rdbuf();
    return text.str();
}

// The default cutoffs listed in the reference README ("| name | largest | cutoff |").
std::map<std::string, std::string> ReadmeCutoffs() {
    std::map<std::string, std::string> cutoffs;
    std::istringstream lines(ReadText(std::string(TB_TEST_DATA_DIR) + "/matrices/README.md"));
    for (std::string line; std::getline(lines, line);) {
        std::istringstream cells(line);
        std::string bar, name, largest, cutoff;
        if (cells >> bar >> name >> bar >> largest >> bar >> cutoff && largest != "largest" &&
            std::isdigit(static_cast<unsigned char>(cutoff[0]))) {
            cutoffs[name] = cutoff;
        }
    }
    return cutoffs;
}

class TempDir {
  public:
    TempDir() {
        std::random_device seed;
        m_path = fs::temp_directory_path() / ("tb_matrix_cli_" + std::to_string(seed()));
        fs::create_directories(m_path);
    }
    ~TempDir() { fs::remove_all(m_path); }
    std::string File(const std::string& name, const std::string& text) const {
        const std::string path = (m_path / name).string();
        std::ofstream(path, std::ios::binary) << text;
        return path;
    }

  private:
    fs::path m_path;
};

}  // namespace

TEST(MatrixCli, ListsTheBuiltinNamesInOrder) {
    const CRun run = Matrix({"list"});
    EXPECT_EQ(run.status, kCliDone);
    std::string expected;
    for (const std::string& name : ReferenceMatrixNames())
        expected += name + "\n";
    EXPECT_EQ(run.out, expected);
}

TEST(MatrixCli, ShowGivesEveryBuiltinTableInTheFileLayout) {
    for (const std::string& name : ReferenceMatrixNames()) {
        const CRun run = Matrix({"show", name});
        ASSERT_EQ(run.status, kCliDone) << name << run.err;
        EXPECT_EQ(run.out.substr(0, run.out.find('\n', run.out.find('\n') + 1) + 1),
                  "#  Matrix made by Tiler\n#  " + name + "\n");

        const ReferenceMatrix reference = LoadReferenceMatrix(name);
        const ReferenceMatrix shown = ParseReferenceMatrix(run.out);
        EXPECT_EQ(shown.letters, reference.letters) << name;
        EXPECT_EQ(shown.rows, reference.rows) << name;

        // Apart from its source note, the reference file has the program's exact layout.
        std::string expected = ReadText(ReferenceMatrixPath(name));
        const std::size_t source = expected.find("#  Source:");
        ASSERT_NE(source, std::string::npos);
        expected.erase(source, expected.find('\n', source) + 1 - source);
        EXPECT_EQ(run.out, expected) << name;
    }
}

TEST(MatrixCli, InfoGivesCutoffsAndWindowScore) {
    const std::map<std::string, std::string> cutoffs = ReadmeCutoffs();
    ASSERT_EQ(cutoffs.size(), 18u);
    for (const std::string& name : ReferenceMatrixNames()) {
        const CRun run = Matrix({"info", name});
        ASSERT_EQ(run.status, kCliDone) << name << run.err;
        auto info = InfoOf(run.out);
        const bool nucleotide = name.find("dna") != std::string::npos;
        EXPECT_EQ(info["name"], name);
        EXPECT_EQ(info["type"], nucleotide ? "nucleotide" : "protein");
        EXPECT_EQ(info["size"], nucleotide ? "17" : "23");
        // Both nucleotide tables score a match 10.
        EXPECT_EQ(info["default cutoff"], nucleotide ? "30" : cutoffs.at(name)) << name;
        EXPECT_EQ(info["statistics"], "none");
    }
    EXPECT_EQ(InfoOf(Matrix({"info", "blosum62mt"}).out)["expected window score"], "-2");
}

TEST(MatrixCli, FilesAreShownAsTheWriterWritesThem) {
    TempDir dir;
    const std::string path = dir.File("family.mat",
                                      "# my matrix\n A R\nA 4,-1\nR -1 5\n"
                                      "3 0.25 0.05 *\n4 0.5 0.125\n");
    const CRun show = Matrix({"show", path});
    ASSERT_EQ(show.status, kCliDone) << show.err;
    EXPECT_EQ(show.out.substr(0, show.out.find("#  Statistical")),
              "#  Matrix made by Tiler\n#  family\n   A  R\nA  4 -1\nR -1  5\n\n");
    EXPECT_NE(show.out.find("#\tm\tlambda\tK\n\t3\t0.2500\t0.0500\t*\n\t4\t0.5000\t0.1250\n"),
              std::string::npos);

    // What show prints reads back to the same output.
    const CRun again = Matrix({"show", dir.File("family.txt", show.out)});
    EXPECT_EQ(again.out, show.out);

    const auto info = InfoOf(Matrix({"info", path}).out);
    EXPECT_EQ(info.at("name"), "family");
    EXPECT_EQ(info.at("type"), "none");
    EXPECT_EQ(info.at("size"), "2");
    EXPECT_EQ(info.at("default cutoff"), "15");
    EXPECT_EQ(info.at("statistics"), "2");
}

TEST(MatrixCli, UnknownNamesAndBadFilesExitWithStatusTwo) {
    TempDir dir;
    const std::vector<std::vector<std::string>> bad = {
        {"show", "blosum63mt"},
        {"info", (fs::temp_directory_path() / "no-such-matrix.txt").string()},
        {"show", dir.File("noheader.txt", "# only comments\n12 13\n")},
        {"info", dir.File("long.txt", " A R\nA 1 2 3\nR 1 2\n")},
        {"show"},
        {"frobnicate"},
    };
    for (const auto& args : bad) {
        const CRun run = Matrix(args);
        EXPECT_EQ(run.status, kCliBadInput) << args[0];
        EXPECT_EQ(run.out, "") << args[0];
        EXPECT_FALSE(run.err.empty()) << args[0];
    }
    EXPECT_NE(Matrix({"info", dir.File("long2.txt", " A R\nA 1 2 3\n")}).err.find("row A"),
              std::string::npos);
}

TEST(MatrixCli, DamagedFilesAreRefusedNamingTheLine) {
    TempDir dir;
    const CRun show =
        Matrix({"show", dir.File("short.mat", "# two letters\n  A  R\nA 4 -1\nR -1\n")});
    EXPECT_EQ(show.status, kCliBadInput);
    EXPECT_EQ(show.out, "");
    EXPECT_NE(show.err.find("line 4: row R has 1 values, 2 expected"), std::string::npos);

    // A matrix whose default cutoff would be 0 is no matrix to search with.
    const std::string flat = dir.File("flat.mat", "  A  R\nA 0 -1\nR -1 0\n");
    const std::string fasta = dir.File("g.fa", ">a\nAR\n>b\nAR\n");
    const CRun search = RunTool({"search", "--quiet", "--matrix", flat, fasta});
    EXPECT_EQ(search.status, kCliBadInput);
    EXPECT_EQ(search.out, "");
    EXPECT_NE(search.err.find("a cutoff must be at least 1"), std::string::npos);
}

TEST(MatrixCli, TheInstalledToolReportsThroughItsExitStatus) {
    FILE* pipe =
        popen((std::string(TB_CLI_PATH) + " matrix show blosum63mt 2>/dev/null").c_str(), "r");
    ASSERT_NE(pipe, nullptr);
    char buffer[256];
    const std::size_t read = std::fread(buffer, 1, sizeof buffer, pipe);
    const int status = pclose(pipe);
    EXPECT_EQ(read, 0u);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), kCliBadInput);

    pipe = popen((std::string(TB_CLI_PATH) + " matrix list").c_str(), "r");
    ASSERT_NE(pipe, nullptr);
    std::string out;
    for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
        out.append(buffer, n);
    EXPECT_EQ(WEXITSTATUS(pclose(pipe)), kCliDone);
    EXPECT_EQ(out.substr(0, 11), "blosum30mt\n");
}
