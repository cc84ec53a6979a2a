// tiler-blocks-cli import and export.

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

std::string Fixture(const std::string& name) {
    return std::string(TB_TEST_DATA_DIR) + "/sequences/" + name;
}

class MoleculeCli : public ::testing::Test {
  protected:
    void SetUp() override {
        m_dir = fs::temp_directory_path() /
                ("tb-mol-cli-" +
                 std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()));
        fs::remove_all(m_dir);
        fs::create_directories(m_dir);
    }
    void TearDown() override { fs::remove_all(m_dir); }

    std::string Write(const std::string& name, const std::string& content) {
        std::string path = (m_dir / name).string();
        std::ofstream(path, std::ios::binary) << content;
        return path;
    }
    std::string Read(const std::string& path) {
        std::ifstream in(path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(in), {});
    }
    std::string Path(const std::string& name) { return (m_dir / name).string(); }

    fs::path m_dir;
};

TEST_F(MoleculeCli, ImportListsNamesAndLengths) {
    std::string fasta = Write("two.fa", ">a\nMKV\n>b\nWWLL\n");
    CRun run = RunTool({"import", Fixture("swissprot_globins.txt"), fasta, fasta});
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(run.out,
              "MYG_HORSE\t153\nHBA_AILME\t141\nMYG_MUSAN\t148\na\t3\nb\t4\na#2\t3\nb#2\t4\n");
    EXPECT_EQ(run.err, "");
}

TEST_F(MoleculeCli, UnrecognisedFilesNeedRaw) {
    std::string raw = Write("plain.txt", "MKVL WWA\n");
    CRun refused = RunTool({"import", raw});
    EXPECT_EQ(refused.status, 2);
    EXPECT_EQ(refused.out, "");
    EXPECT_EQ(refused.err, "Unrecognized file format: " + raw + "\n");

    CRun accepted = RunTool({"import", "--raw", "protein", raw});
    EXPECT_EQ(accepted.status, 0);
    EXPECT_EQ(accepted.out, "plain\t7\n");

    // Import reads into a protein project: nucleic raw input is refused.
    CRun dna = RunTool({"import", "--raw", "dna", raw});
    EXPECT_EQ(dna.status, 2);
    EXPECT_NE(dna.err.find("Unrecognized file format: " + raw), std::string::npos);
    EXPECT_EQ(RunTool({"import", "--raw", "rna", raw}).status, 2);
}

TEST_F(MoleculeCli, RefusedAndBadFilesExitWithInputError) {
    CRun nucleic = RunTool({"import", Fixture("genbank_nucleic.gb")});
    EXPECT_EQ(nucleic.status, 2);
    EXPECT_EQ(nucleic.err, "You cannot add a nucleic acid sequence to an amino acid project.\n");

    std::string bad = Write("bad.seq", "MKV\nMKJ\n");
    CRun illegal = RunTool({"import", "--raw", "protein", bad});
    EXPECT_EQ(illegal.status, 2);
    EXPECT_EQ(illegal.err,
              "Sequence File bad.seq: Contains Illegal Character(s) in Line 2 (the record at line "
              "1 was skipped)\n");

    CRun missing = RunTool({"import", Path("none.fa")});
    EXPECT_EQ(missing.status, 2);
    EXPECT_NE(missing.err.find("none.fa"), std::string::npos);
}

TEST_F(MoleculeCli, ExportWritesEveryMolecule) {
    std::string out = Path("out.fa");
    CRun run =
        RunTool({"export", "--format", "fasta", "-o", out, Fixture("swissprot_globins.txt")});
    ASSERT_EQ(run.status, 0) << run.err;
    std::string text = Read(out);
    EXPECT_EQ(text.substr(0, 12), ">MYG_HORSE\r\n");
    EXPECT_EQ(std::count(text.begin(), text.end(), '>'), 3);

    // What the GenPept and SWISS-PROT writers wrote imports to the same molecules.
    CRun original = RunTool({"import", Fixture("swissprot_globins.txt")});
    for (std::string format : {"genpept", "swissprot", "fasta", "raw"}) {
        std::string path = Path("out." + format);
        ASSERT_EQ(
            RunTool({"export", "--format", format, "-o", path, Fixture("swissprot_globins.txt")})
                .status,
            0);
        std::vector<std::string> args = {"import", path};
        if (format == "raw")
            args = {"import", "--raw", "protein", path};
        CRun again = RunTool(args);
        if (format == "raw") {
            EXPECT_EQ(again.out, "out\t442\n");  // one line per molecule, one block
        } else {
            EXPECT_EQ(again.out, original.out) << format;
        }
    }
}

TEST_F(MoleculeCli, ExportOfNucleicAcidsUsesGenBankAndEmbl) {
    std::string gb = Path("n.gb");
    ASSERT_EQ(
        RunTool({"export", "--format", "genpept", "-o", gb, Fixture("embl_nucleic.embl")}).status,
        0);
    EXPECT_EQ(Read(gb).substr(0, 5), "LOCUS");
    EXPECT_NE(Read(gb).find(" bp "), std::string::npos);
    std::string embl = Path("n.embl");
    ASSERT_EQ(RunTool({"export", "--format", "swissprot", "-o", embl, gb}).status, 0);
    EXPECT_NE(Read(embl).find("ID   TB000010; SV 1; circular;"), std::string::npos);

    // Mixed molecule types cannot go into one file: nothing is written.
    std::string mixed = Path("mixed.fa");
    CRun run =
        RunTool({"export", "--format", "fasta", "-o", mixed, gb, Fixture("genpept_globin.gp")});
    EXPECT_EQ(run.status, 2);
    EXPECT_FALSE(fs::exists(mixed));
}

TEST_F(MoleculeCli, ExportChecksItsOptions) {
    EXPECT_EQ(RunTool({"export", "--format", "pdb", "-o", Path("x"), Fixture("genpept_globin.gp")})
                  .status,
              2);
    EXPECT_EQ(RunTool({"export", "--format", "fasta", Fixture("genpept_globin.gp")}).status, 2);
    EXPECT_EQ(RunTool({"export", "--format", "fasta", "-o", "/nonexistent/dir/x.fa",
                       Fixture("genpept_globin.gp")})
                  .status,
              2);
}

// Two good records around a header without sequence (line 3) and a blank line inside one.
const char* kDamagedFasta = ">a\nMKVL\n>lost\n>b\nWW\n\nLL\n";
// Two GenPept entries without sequence, on lines 1 and 3.
const char* kEmptyGenPept = "LOCUS  X 2 aa\n//\nLOCUS  Y 2 aa\n//\n";

TEST_F(MoleculeCli, ImportTellsSkippedRecordsAndReadsTheRest) {
    const std::string path = Write("d.fa", kDamagedFasta);
    const CRun run = RunTool({"import", path});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "a\t4\nb\t4\n");
    EXPECT_EQ(run.err, "File d.fa: No sequence data found (the record at line 3 was skipped)\n");
}

TEST_F(MoleculeCli, FileWithoutReadableRecordIsAnInputError) {
    const std::string empty = Write("e.gp", kEmptyGenPept);
    const CRun run = RunTool({"import", empty});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err,
              "File e.gp: No sequence data found (the record at line 1 was skipped)\n"
              "File e.gp: No sequence data found (the record at line 3 was skipped)\n");

    // Next to a good file the molecules of the good one are listed, and the status still
    // says that one file gave nothing.
    const CRun mixed = RunTool({"import", Write("good.fa", ">g\nMKV\n"), empty});
    EXPECT_EQ(mixed.status, 2);
    EXPECT_EQ(mixed.out, "g\t3\n");
}

TEST_F(MoleculeCli, ExportWritesNothingWithoutAReadableRecord) {
    const std::string out = Write("out.fa", "previous contents\n");
    const CRun refused =
        RunTool({"export", "--format", "fasta", "-o", out, Write("e.gp", kEmptyGenPept)});
    EXPECT_EQ(refused.status, 2);
    EXPECT_EQ(Read(out), "previous contents\n");
    const std::string fresh = Path("fresh.fa");
    EXPECT_EQ(RunTool({"export", "--format", "fasta", "-o", fresh, Path("e.gp")}).status, 2);
    EXPECT_FALSE(fs::exists(fresh));

    // Damaged records are left out, with their message; the others are written.
    const CRun partial =
        RunTool({"export", "--format", "fasta", "-o", out, Write("d.fa", kDamagedFasta)});
    EXPECT_EQ(partial.status, 0);
    EXPECT_NE(partial.err.find("line 3 was skipped"), std::string::npos);
    EXPECT_EQ(RunTool({"import", out}).out, "a\t4\nb\t4\n");
}

TEST_F(MoleculeCli, SearchRefusesAFileWithoutMolecules) {
    const CRun run = RunTool({"search", "--quiet", Write("e.gp", kEmptyGenPept)});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.out, "");
    EXPECT_NE(run.err.find("File e.gp: No sequence data found"), std::string::npos);
}

TEST_F(MoleculeCli, EndlessInputStopsAtTheSizeLimit) {
    const CRun run = RunTool({"import", "/dev/zero"});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.out, "");
    EXPECT_NE(run.err.find("/dev/zero: more than 1 GiB; sequence files are read up to 1 GiB"),
              std::string::npos)
        << run.err;
}

}  // namespace
