// tiler-blocks-cli info, msf, link, unlink and define-block on saved projects.

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

#include "BlockProject.h"
#include "TextLines.h"
#include "archive/FileIO.h"
#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

std::string ReadText(const std::string& path) {
    const std::vector<std::uint8_t> bytes = ReadWholeFile(path);
    return std::string(bytes.begin(), bytes.end());
}

// The published GCG checksum, written out independently of the exporter.
int Gcg(const std::string& sequence) {
    long sum = 0;
    for (std::size_t i = 0; i < sequence.size(); ++i) {
        sum += static_cast<long>(i % 57 + 1) * static_cast<unsigned char>(sequence[i]);
    }
    return static_cast<int>(sum % 10000);
}

// The sequences of an MSF file, gathered from its interleaved lines.
std::map<std::string, std::string> MsfSequences(const std::string& text) {
    std::map<std::string, std::string> sequences;
    bool body = false;
    for (const std::string& line : Lines(text)) {
        if (line == "//") {
            body = true;
            continue;
        }
        std::istringstream words(line);
        std::string name;
        if (!body || !(words >> name) || std::isdigit(static_cast<unsigned char>(name[0])))
            continue;
        for (std::string group; words >> group;)
            sequences[name] += group;
    }
    return sequences;
}

class ProjectCli : public ::testing::Test {
  protected:
    void SetUp() override {
        m_dir = fs::temp_directory_path() /
                ("tb-project-cli-" +
                 std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()));
        fs::remove_all(m_dir);
        fs::create_directories(m_dir);
    }
    void TearDown() override { fs::remove_all(m_dir); }
    std::string Path(const std::string& name) const { return (m_dir / name).string(); }

    // Searches a sequence file from the command line and saves the project.
    std::string SearchedProject(const std::string& fasta, int minSequences) {
        const std::string path = Path("searched.bpr");
        const CRun run = RunTool({"search", fasta, "--min-seqs", std::to_string(minSequences),
                                  "--save", path, "--quiet"});
        EXPECT_EQ(run.status, 0) << run.err;
        return path;
    }

    // --rows for block `index`: its members' residues, which are also their display columns
    // while nothing is linked before them.
    static std::string RowsOfBlock(const CBlockProject& project, int index) {
        const CSimBlock& block = *project.BlockSet().BlockAt(index);
        const CAlignmentLayout layout = project.Layout();
        std::string rows;
        for (const CBlockRowRange& range : BlockRowRanges(layout, block)) {
            rows += (rows.empty() ? "" : ",") + layout.RowAt(range.row).name + ":" +
                    std::to_string(range.start + 1) + "-" + std::to_string(range.end);
        }
        return rows;
    }

    fs::path m_dir;
};

std::string Myoglobins() {
    return std::string(TB_TEST_DATA_DIR) + "/projects/myoglobins6.fa";
}

// The bundled example: 45 globins.
std::string Globins() {
    return std::string(TB_TEST_DATA_DIR) + "/../../resources/examples/globins.fa";
}

// --rows for one line of the block table: each member's residues from its start over the
// block's width, exactly as a user would copy them from the table.
std::string RowsOfTableLine(const std::string& line) {
    std::vector<std::string> fields;
    std::istringstream in(line);
    for (std::string field; std::getline(in, field, '\t');)
        fields.push_back(field);
    const int width = std::stoi(fields.at(3));
    std::string rows;
    std::istringstream members(fields.at(9));
    for (std::string member; std::getline(members, member, ',');) {
        const std::size_t colon = member.rfind(':');
        const int start = std::stoi(member.substr(colon + 1));
        rows += (rows.empty() ? "" : ",") + member.substr(0, colon + 1) + std::to_string(start) +
                "-" + std::to_string(start + width - 1);
    }
    return rows;
}

std::vector<std::string> Split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::istringstream in(text);
    for (std::string part; std::getline(in, part, separator);)
        parts.push_back(part);
    return parts;
}

TEST_F(ProjectCli, InfoListsParametersMoleculesBlocksAndLinks) {
    const std::string path = SearchedProject(Myoglobins(), 6);
    const CRun run = RunTool({"info", path});
    ASSERT_EQ(run.status, 0) << run.err;
    const std::vector<std::string> lines = Lines(run.out);
    ASSERT_GE(lines.size(), 12u);
    EXPECT_EQ(lines[0], "# parameters");
    EXPECT_EQ(lines[1], "matrix\tblosum62mt");
    EXPECT_EQ(lines[2], "cutoff\t33");
    EXPECT_EQ(lines[3], "min-seqs\t6");
    EXPECT_EQ(lines[5], "# molecules");
    EXPECT_EQ(lines[6], "MYG_ESCGI\t153");
    const std::unique_ptr<CBlockProject> project = CBlockProject::Load(path);
    const int blocks = project->BlockSet().BlockCount();
    ASSERT_GT(blocks, 0);
    auto at = std::find(lines.begin(), lines.end(), "# blocks");
    ASSERT_NE(at, lines.end());
    EXPECT_EQ(*(at + 1), "#block\tname\tm\tlen\tMP-score\tSP-score\tSignif.\tP\tOffset\tmembers");
    // Every block of the first search spans all six myoglobins.
    const std::string& first = *(at + 2);
    EXPECT_EQ(first.rfind("1\t\t6\t", 0), 0u) << first;
    EXPECT_EQ(std::count(first.begin(), first.end(), ','), 5);
    EXPECT_EQ(lines.back(), "# links");
}

TEST_F(ProjectCli, LinkTheFirstTwoBlocksFromTheTableThenExportMsf) {
    const std::string path = Path("globins.bpr");
    CRun run = RunTool({"search", Globins(), "--save", path, "--quiet"});
    ASSERT_EQ(run.status, 0) << run.err;
    const std::vector<std::string> table = Lines(run.out);
    ASSERT_GE(table.size(), 3u);
    const int molecules = CBlockProject::Load(path)->MoleculeCount();

    // Link block 1, then each next block of the table until one more links. Blocks that
    // contradict the first link (globin blocks overlap at other offsets in some members) are
    // refused with the program's message and leave the file alone. Each link prints its
    // stretches as --rows takes them, then the columns they now hold.
    int linked = 0;
    bool shifted = false;  // some stretch of the second link stands in other columns than residues
    for (std::size_t line = 1; line < table.size() && linked < 2; ++line) {
        const std::string rows = RowsOfTableLine(table[line]);
        const std::string before = ReadText(path);
        run = RunTool({"link", path, "--rows", rows});
        if (run.status != 0) {
            ASSERT_GT(linked, 0) << run.err;
            EXPECT_EQ(run.err,
                      "tiler-blocks-cli: Block can not be linked.\n"
                      "tiler-blocks-cli: nothing linked\n");
            EXPECT_EQ(ReadText(path), before);
            continue;
        }
        ++linked;
        std::vector<std::string> printed;
        for (const std::string& stretch : Lines(run.out)) {
            const std::vector<std::string> fields = Split(stretch, '\t');
            ASSERT_EQ(fields.size(), 2u) << stretch;
            printed.push_back(fields[0]);
            shifted =
                shifted || (linked == 2 && fields[0].substr(fields[0].rfind(':') + 1) != fields[1]);
        }
        std::vector<std::string> asked = Split(rows, ',');
        std::sort(printed.begin(), printed.end());
        std::sort(asked.begin(), asked.end());
        EXPECT_EQ(printed, asked) << "block " << line;
    }
    ASSERT_EQ(linked, 2);
    EXPECT_TRUE(shifted);
    std::unique_ptr<CBlockProject> project = CBlockProject::Load(path);
    ASSERT_EQ(project->Links().Count(), 2);
    // Every linked residue stands in its link's column.
    const CAlignmentLayout layout = project->Layout();
    for (const auto& link : project->Links()) {
        for (int k = 0; k < link->MoleculeCount(); ++k) {
            const CSegmentRow& row = layout.RowAt(layout.RowOfEntry(link->Molecule(k))).segments;
            EXPECT_EQ(row.PositionToColumn(link->Position(k)), link->Column());
        }
    }

    const std::string msf = Path("out.msf");
    run = RunTool({"msf", path, msf});
    ASSERT_EQ(run.status, 0) << run.err;
    const std::string text = ReadText(msf);
    const std::map<std::string, std::string> sequences = MsfSequences(text);
    ASSERT_EQ(static_cast<int>(sequences.size()), molecules);
    int total = 0;
    for (const auto& [name, sequence] : sequences) {
        EXPECT_EQ(static_cast<int>(sequence.size()), layout.ColumnCount());
        const int check = Gcg(sequence);
        total += check;
        EXPECT_NE(text.find(" Name: " + name + " \tLen: " + std::to_string(layout.ColumnCount()) +
                            "\tCheck: " + std::to_string(check) + "\tWeight: 0\n"),
                  std::string::npos)
            << name;
        // The aligned text is the alignment's, in upper case with '.' for gaps.
        std::string shown = layout.DisplaySeqOf(layout.IndexOfRow(name)).Text();
        shown.resize(layout.ColumnCount(), '-');
        for (char& c : shown)
            c = c == '-' ? '.' : static_cast<char>(std::toupper(c));
        EXPECT_EQ(sequence, shown);
    }
    EXPECT_NE(text.find("Check: " + std::to_string(total % 10000) + "   ..\n"), std::string::npos);

    if (std::system("command -v seqret > /dev/null 2>&1") != 0)
        GTEST_SKIP() << "no EMBOSS";
    const std::string fasta = Path("back.fa");
    const std::string command = "seqret -auto -sformat msf -sequence '" + msf +
                                "' -osformat fasta -outseq '" + fasta + "' 2>/dev/null";
    ASSERT_EQ(std::system(command.c_str()), 0);
    std::map<std::string, std::string> readBack;
    std::string current;
    for (const std::string& line : Lines(ReadText(fasta))) {
        if (!line.empty() && line[0] == '>') {
            current = line.substr(
                1, line.find(' ') == std::string::npos ? std::string::npos : line.find(' ') - 1);
            continue;
        }
        readBack[current] += line;
    }
    ASSERT_EQ(readBack.size(), sequences.size());
    for (const auto& [name, sequence] : sequences) {
        std::string expected = sequence;
        std::replace(expected.begin(), expected.end(), '.', '-');
        EXPECT_EQ(readBack[name], expected) << name;
    }
}

TEST_F(ProjectCli, SearchMsfMatchesTheSavedProjectsMsf) {
    const std::string saved = Path("s.bpr");
    const std::string direct = Path("direct.msf");
    CRun run = RunTool({"search", Myoglobins(), "--save", saved, "--msf", direct, "--quiet"});
    ASSERT_EQ(run.status, 0) << run.err;
    run = RunTool({"msf", saved, Path("later.msf")});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(ReadText(direct), ReadText(Path("later.msf")));
}

TEST_F(ProjectCli, UnlinkDefineBlockAndOutputFile) {
    const std::string path = SearchedProject(Myoglobins(), 6);
    const std::unique_ptr<CBlockProject> project = CBlockProject::Load(path);
    const std::string rows = RowsOfBlock(*project, 0);
    const std::string linked = Path("linked.bpr");
    CRun run = RunTool({"link", path, "--rows", rows, "-o", linked});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_TRUE(CBlockProject::Load(path)->Links().IsEmpty());
    EXPECT_EQ(CBlockProject::Load(linked)->Links().Count(), 1);

    run = RunTool({"unlink", linked, "--rows", rows});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_TRUE(CBlockProject::Load(linked)->Links().IsEmpty());
    run = RunTool({"unlink", linked, "--rows", rows});
    EXPECT_EQ(run.status, 2);

    // Two rows, columns 1-10 and 3-12: a block of width 10 named ud1.
    const std::string first = project->MoleculeAt(0)->Name();
    const std::string second = project->MoleculeAt(1)->Name();
    run = RunTool({"define-block", linked, "--rows", first + ":1-10," + second + ":12-3"});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_NE(run.out.find("\tud1\t2\t10\t"), std::string::npos) << run.out;
    EXPECT_NE(run.out.find(first + ":1," + second + ":3"), std::string::npos) << run.out;
    EXPECT_EQ(CBlockProject::Load(linked)->BlockSet().BlockCount(),
              project->BlockSet().BlockCount() + 1);
}

TEST_F(ProjectCli, BadInputIsRefusedAndLeavesTheProjectFileAlone) {
    const std::string path = SearchedProject(Myoglobins(), 6);
    const std::string before = ReadText(path);
    const std::unique_ptr<CBlockProject> project = CBlockProject::Load(path);
    const std::string name = project->MoleculeAt(0)->Name();

    for (const std::string& rows : {name + ":5", name + ":a-9", name + ":0-4", name + "-4"}) {
        const CRun run = RunTool({"link", path, "--rows", rows});
        EXPECT_EQ(run.status, 2) << rows;
        EXPECT_EQ(run.err.rfind("tiler-blocks-cli: --rows ", 0), 0u) << run.err;
        EXPECT_NE(run.err.find("\nRun 'tiler-blocks-cli link --help' for usage.\n"),
                  std::string::npos)
            << run.err;
    }
    // Names the project does not have, residues past a molecule's end, and no selection at all.
    const int length = project->MoleculeAt(0)->SequenceLength();
    const std::vector<std::pair<std::vector<std::string>, std::string>> refused = {
        {{"--rows", "NOSUCH:1-5," + name + ":1-5"}, "no molecule named 'NOSUCH'"},
        {{"--columns", name + ":1-5,NOSUCH:1-5"}, "no molecule named 'NOSUCH'"},
        {{"--rows", name + ":1-" + std::to_string(length + 1)}, "lie outside " + name},
        {{}, "--rows or --columns"}};
    for (const auto& [options, message] : refused) {
        std::vector<std::string> args = {"link", path};
        args.insert(args.end(), options.begin(), options.end());
        const CRun run = RunTool(args);
        EXPECT_EQ(run.status, 2) << message;
        EXPECT_EQ(run.err.rfind("tiler-blocks-cli: ", 0), 0u) << run.err;
        EXPECT_NE(run.err.find(message), std::string::npos) << run.err;
    }
    EXPECT_EQ(ReadText(path), before);
    // A crossing link is refused with the program's message.
    const std::string other = project->MoleculeAt(1)->Name();
    ASSERT_EQ(RunTool({"link", path, "--rows", name + ":1-5," + other + ":1-5"}).status, 0);
    const std::string linked = ReadText(path);
    const CRun crossing = RunTool({"link", path, "--rows", name + ":20-24," + other + ":1-3"});
    EXPECT_EQ(crossing.status, 2);
    EXPECT_NE(crossing.err.find("tiler-blocks-cli: Block can not be linked.\n"), std::string::npos)
        << crossing.err;
    EXPECT_EQ(ReadText(path), linked);

    std::ofstream(Path("cut.bpr"), std::ios::binary) << before.substr(0, before.size() / 2);
    CRun run = RunTool({"info", Path("cut.bpr")});
    EXPECT_EQ(run.status, 2);
    // The program's message, and beyond it which part of the file ended early.
    EXPECT_EQ(
        run.err.rfind("tiler-blocks-cli: " + Path("cut.bpr") + "\nUnexpected end of file. (", 0),
        0u)
        << run.err;
    run = RunTool({"msf", Myoglobins(), Path("x.msf")});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err, "tiler-blocks-cli: " + Myoglobins() + " is not a block project\n");
    run = RunTool({"info", Myoglobins()});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err.rfind("tiler-blocks-cli: ", 0), 0u) << run.err;
    EXPECT_FALSE(fs::exists(Path("x.msf")));
}

}  // namespace
