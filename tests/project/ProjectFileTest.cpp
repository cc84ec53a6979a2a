#include <gtest/gtest.h>

#include <random>

#include "BroadcastRecord.h"
#include "ProjectFixtures.h"
#include "archive/FileIO.h"

namespace {

const char* const kFasta =
    ">alpha\nMKVLAATWWGHDEKLMNPQRST\n"
    ">beta\nATWWGHPQRSTVV\n"
    ">gamma\nGGMKVLAATWWGHDE\n";

class ProjectFileTest : public ::testing::Test {
  protected:
    void SetUp() override {
        InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}, {{0, 2}, {0, 2}, 4, 20}});
        ASSERT_TRUE(
            project.Link(std::vector<ALN_BSEL_ENTRY>{{"alpha", 5, 11}, {"beta", 0, 6}}, prompt));
        project.Params().SetPalette({0x0000FF, 0x00FF00});
        project.Params().SetExpectationLimit(0.5);
        project.Params().SetTextColour(0x123456);
        path = dir.File("project.bpr");
        project.Save(path);
    }

    CScratchDir dir{"tb_project_file"};
    CBlockProject project = ProjectWith(dir, kFasta);
    CRecordingPrompt prompt;
    std::string path;
};

TEST_F(ProjectFileTest, SavedProjectOpensWithKeysBlocksLinksAndParameters) {
    CBlockProject opened;
    ASSERT_EQ(opened.Open(path, prompt), CBlockProject::kOpened);
    EXPECT_TRUE(prompt.Messages().empty());
    ASSERT_EQ(opened.MoleculeCount(), 3);
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(opened.MoleculeAt(i)->Key(), project.MoleculeAt(i)->Key());
        EXPECT_EQ(opened.MoleculeAt(i)->Name(), project.MoleculeAt(i)->Name());
        EXPECT_EQ(opened.MoleculeAt(i)->Sequence(), project.MoleculeAt(i)->Sequence());
        EXPECT_EQ(opened.BlockMoleculeAt(i), opened.MoleculeAt(i));
    }
    ASSERT_EQ(opened.BlockSet().BlockCount(), 2);
    for (int b = 0; b < 2; ++b)
        EXPECT_EQ(*opened.BlockSet().BlockAt(b), *project.BlockSet().BlockAt(b));
    EXPECT_EQ(opened.Links(), project.Links());
    EXPECT_EQ(opened.Params().TextColour(), 0x123456u);
    EXPECT_DOUBLE_EQ(opened.Params().ExpectationLimit(), 0.5);
    EXPECT_EQ(opened.BlockColour(3), 0x00FF00u);
    EXPECT_TRUE(opened.Params().Matrix().Equals(project.Params().Matrix()));
    // Only the loaded links are in the history.
    EXPECT_EQ(opened.History().Count(), 1);
    EXPECT_FALSE(opened.CanUndo());
    EXPECT_FALSE(opened.Undo());
    // Saving again gives the same bytes.
    EXPECT_EQ(opened.ToBytes(), project.ToBytes());
}

TEST_F(ProjectFileTest, OtherFilesAreRecognisedAndLeaveTheProjectAlone) {
    const std::vector<std::uint8_t> before = project.ToBytes();
    EXPECT_EQ(project.Open(dir.Write("seqs.fa", kFasta), prompt), CBlockProject::kNotBlockProject);
    EXPECT_TRUE(prompt.Messages().empty());
    EXPECT_EQ(project.Open(dir.File("absent.bpr"), prompt), CBlockProject::kOpenFailed);
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text, "Error opening '" + dir.File("absent.bpr") + "' file");
    EXPECT_EQ(project.ToBytes(), before);
    EXPECT_TRUE(CBlockProject::IsBlockProjectData(ReadWholeFile(path)));
}

TEST_F(ProjectFileTest, TruncatedFilesAreRefusedWithAMessage) {
    const std::vector<std::uint8_t> bytes = ReadWholeFile(path);
    CBlockProject current(project);
    const std::vector<std::uint8_t> before = current.ToBytes();
    const std::size_t step = std::max<std::size_t>(1, bytes.size() / 3000);
    for (std::size_t size = 0; size < bytes.size(); size += step) {
        const std::string cut =
            dir.Write("cut.bpr", std::string(bytes.begin(), bytes.begin() + size));
        CRecordingPrompt messages;
        const CBlockProject::OpenResult result = current.Open(cut, messages);
        ASSERT_NE(result, CBlockProject::kOpened) << size;
        // Too short to hold the leading string: simply not a project; otherwise reported.
        if (result == CBlockProject::kOpenFailed) {
            ASSERT_EQ(messages.Messages().size(), 1u);
            EXPECT_EQ(messages.Messages()[0].text.rfind("cut.bpr\n", 0), 0u);
        }
    }
    EXPECT_EQ(current.ToBytes(), before);
}

TEST_F(ProjectFileTest, CorruptedBytesNeverHalfReplaceTheProject) {
    const std::vector<std::uint8_t> bytes = ReadWholeFile(path);
    std::mt19937 random(99);
    CBlockProject current(project);
    const std::vector<std::uint8_t> before = current.ToBytes();
    int refused = 0;
    for (int trial = 0; trial < 2000; ++trial) {
        std::vector<std::uint8_t> corrupt = bytes;
        const int changes = 1 + static_cast<int>(random() % 3);
        for (int c = 0; c < changes; ++c) {
            corrupt[random() % corrupt.size()] = static_cast<std::uint8_t>(random());
        }
        try {
            std::unique_ptr<CBlockProject> loaded = CBlockProject::FromBytes(corrupt);
            if (loaded)
                loaded->Layout();  // whatever survives can be laid out
        } catch (const CArchiveException&) {
            ++refused;
        }
    }
    EXPECT_GT(refused, 500);
    const std::string file =
        dir.Write("corrupt.bpr", std::string(bytes.begin(), bytes.end() - 1) + "x");
    CRecordingPrompt messages;
    EXPECT_EQ(current.Open(file, messages), CBlockProject::kOpenFailed);
    EXPECT_EQ(current.ToBytes(), before);
}

TEST(BroadcastRecord, RoundTripAndOwnRecordsAreIgnored) {
    const CBroadcastRecord sent{41, "MYG_HORSE", 2, 10, 20, 0};
    const std::vector<std::uint8_t> bytes = sent.ToBytes();
    EXPECT_EQ(CBroadcastRecord::FromBytes(bytes, 7), sent);
    EXPECT_EQ(CBroadcastRecord::FromBytes(bytes, 41).moleculeName, "");
    std::vector<std::uint8_t> padded = bytes;
    padded.resize(4096, 0);  // a shared region is larger than the record
    EXPECT_EQ(CBroadcastRecord::FromBytes(padded, 7), sent);
    const std::vector<std::uint8_t> garbage(bytes.begin(), bytes.begin() + 9);
    EXPECT_EQ(CBroadcastRecord::FromBytes(garbage, 7).moleculeName, "");
}

}  // namespace
