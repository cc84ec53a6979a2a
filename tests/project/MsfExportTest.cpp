#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "TextLines.h"
#include "archive/FileIO.h"
#include "layout/AlignmentLayout.h"
#include "msf/MsfExport.h"

namespace {

std::string Repeat(const std::string& unit, int times) {
    std::string text;
    for (int i = 0; i < times; ++i)
        text += unit;
    return text;
}

// The lines of the interleaved part (after "//" and its empty line).
std::vector<std::string> BlockLines(const std::string& text) {
    std::vector<std::string> lines = Lines(text);
    auto it = std::find(lines.begin(), lines.end(), "//");
    return std::vector<std::string>(it + 2, lines.end());
}

TEST(MsfExport, GcgChecksumsByHand) {
    EXPECT_EQ(GcgChecksum("AC"), 1 * 65 + 2 * 67);
    EXPECT_EQ(GcgChecksum("a-"), 1 * 65 + 2 * 46);
    // 60 residues: weights 1..57 then 1..3 again; 65 x 1659 = 107835.
    EXPECT_EQ(GcgChecksum(std::string(60, 'A')), 7835);
    EXPECT_EQ(GcgChecksum(""), 0);
}

TEST(MsfExport, SmallAlignmentIsWrittenExactly) {
    CMsfExport msf;
    msf.SetAlignment(11, {{"seq one", "acdefghiklm", 0, 0}, {"x", "ac-e", 0, 0}});
    ASSERT_TRUE(msf.IsWritable());
    const std::string text = msf.Write();
    const int check1 = GcgChecksum("ACDEFGHIKLM");
    const int check2 = GcgChecksum("AC.E.......");
    const std::string expected =
        "PileUp\n\n"
        "   MSF: 11   Type: P   Check: " +
        std::to_string((check1 + check2) % 10000) +
        "   ..\n\n"
        " Name: seq_one \tLen: 11\tCheck: " +
        std::to_string(check1) +
        "\tWeight: 0\n"
        " Name: x \tLen: 11\tCheck: " +
        std::to_string(check2) +
        "\tWeight: 0\n"
        "\n//\n\n"
        "         1" +
        std::string(12, ' ') +
        "11\n"
        "seq_one  ACDEFGHIKL M\n"
        "      x  AC.E...... .\n"
        "\n";
    EXPECT_EQ(text, expected);
    EXPECT_EQ(msf.Entries()[1].sequence, "AC.E.......");
}

TEST(MsfExport, BlockBoundariesAtTenElevenFiftyAndFiftyOneColumns) {
    auto blocks = [](int length) {
        CMsfExport msf;
        msf.SetAlignment(length, {{"ab", std::string(length, 'w'), 0, 0}});
        return BlockLines(msf.Write());
    };
    // N = 2: position lines start with four blanks.
    EXPECT_EQ(blocks(10), (std::vector<std::string>{"    1", "ab  WWWWWWWWWW", ""}));
    std::vector<std::string> eleven = blocks(11);
    EXPECT_EQ(eleven[0], "    1" + std::string(12, ' ') + "11");
    EXPECT_EQ(eleven[1], "ab  WWWWWWWWWW W");

    std::vector<std::string> fifty = blocks(50);
    ASSERT_EQ(fifty.size(), 3u);
    // The end position's last digit stands above the last residue of a full block.
    EXPECT_EQ(fifty[0].size(), fifty[1].size());
    EXPECT_EQ(fifty[0].substr(fifty[0].size() - 2), "50");
    EXPECT_EQ(fifty[1], "ab " + Repeat(" WWWWWWWWWW", 5));

    std::vector<std::string> fiftyOne = blocks(51);
    ASSERT_EQ(fiftyOne.size(), 6u);
    EXPECT_EQ(fiftyOne[3], "    51");
    EXPECT_EQ(fiftyOne[4], "ab  W");
}

TEST(MsfExport, NothingToWriteWithoutEntriesOrColumns) {
    CMsfExport msf;
    EXPECT_FALSE(msf.IsWritable());
    msf.SetAlignment(0, {{"a", "", 0, 0}});
    EXPECT_FALSE(msf.IsWritable());
    msf.SetAlignment(5, {});
    EXPECT_FALSE(msf.IsWritable());
    msf.Reset();
    EXPECT_FALSE(msf.IsValid());
}

TEST(MsfExport, BuildTakesEntryRowsInEntryOrder) {
    CLinkList links;
    auto link = std::make_unique<CLink>(3);
    link->AddMolecule(1, 3, 2, 0);
    link->AddMolecule(0, 0, 2, 3);
    links.Add(std::move(link));
    // Row order differs from entry order; the row without an entry is left out.
    const CAlignmentLayout layout({{"zeta", "mkvla", 1}, {"free", "ww", -1}, {"alpha", "lagh", 0}},
                                  links);
    CMsfExport msf;
    msf.Build(layout, 3);
    ASSERT_EQ(msf.Entries().size(), 2u);
    EXPECT_EQ(msf.Entries()[0].name, "alpha");
    EXPECT_EQ(msf.Entries()[0].sequence, "---LAgh");
    EXPECT_EQ(msf.Entries()[1].sequence, "mkvLA");
    EXPECT_EQ(msf.Entries()[1].index, 1);
    EXPECT_EQ(msf.Length(), 7);
    const std::string path =
        (std::filesystem::temp_directory_path() / "tb_msf_build_test.msf").string();
    msf.Save(path);
    const std::vector<std::uint8_t> bytes = ReadWholeFile(path);
    const std::string written(bytes.begin(), bytes.end());
    EXPECT_NE(written.find("alpha  ...LAGH\n"), std::string::npos);
    EXPECT_NE(written.find(" zeta  MKVLA..\n"), std::string::npos);
    std::filesystem::remove(path);
}

}  // namespace
