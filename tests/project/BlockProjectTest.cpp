#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "ProjectFixtures.h"

namespace {

// alpha: ATWWGH at 5, PQRST at 17; beta: ATWWGH at 0, PQRST at 6; gamma: MKVLAATWWGHDE at 2.
const char* const kFasta =
    ">alpha\nMKVLAATWWGHDEKLMNPQRST\n"
    ">beta\nATWWGHPQRSTVV\n"
    ">gamma\nGGMKVLAATWWGHDE\n";

class BlockProjectTest : public ::testing::Test {
  protected:
    CScratchDir dir{"tb_project"};
    CBlockProject project = ProjectWith(dir, kFasta);
    CRecordingPrompt prompt;

    bool Link(std::vector<ALN_BSEL_ENTRY> selection,
              std::vector<ALN_BSEL_ENTRY>* columns = nullptr) {
        return project.Link(selection, prompt, columns);
    }
    std::string Texts() const {
        const CAlignmentLayout layout = project.Layout();
        std::string text;
        for (int r = 0; r < layout.RowCount(); ++r)
            text += layout.DisplaySeqOf(r).Text() + "\n";
        return text;
    }
};

TEST(BlockProjectDefaults, NewProjectTakesTheUsersDefaultTemplate) {
    CScratchDir settings("tb_settings");
    {
        const CBlockProject project(settings.Path().string());
        EXPECT_EQ(project.MoleculeType(), kTypeProtein);
        EXPECT_EQ(project.Params().Cutoff(), 33);
        EXPECT_EQ(project.Params().MinSequences(), 5);
        EXPECT_DOUBLE_EQ(project.Params().ExpectationLimit(), 0.0001);
        EXPECT_EQ(project.Params().Matrix().Name(), "blosum62mt");
    }
    CQuilterParams stored;
    stored.SetMatrix(CScoreMatrix("blosum80mt"));
    stored.SetCutoff(10);
    stored.SetMinSequences(7);
    stored.SetPalette({0x0000FF, 0x00FF00, 0xFF0000});
    CRecordingPrompt prompt;
    ASSERT_TRUE(stored.SaveTemplate(settings.File("default.bp1"), prompt));
    {
        const CBlockProject project(settings.Path().string());
        EXPECT_EQ(project.Params().Matrix().Name(), "blosum80mt");
        EXPECT_EQ(project.Params().Cutoff(), 48);
        EXPECT_EQ(project.Params().MinSequences(), 7);
        EXPECT_EQ(project.BlockColour(4), 0x00FF00u);
    }
    // A damaged default template silently gives the defaults.
    const std::vector<std::uint8_t> bytes = stored.TemplateBytes();
    settings.Write("default.bp1", std::string(bytes.begin(), bytes.begin() + bytes.size() / 2));
    const CBlockProject project(settings.Path().string());
    EXPECT_EQ(project.Params().Cutoff(), 33);
    EXPECT_EQ(project.Params().MinSequences(), 5);
    EXPECT_EQ(project.BlockColour(4), CQuilterParams::kEmptyPaletteColour);
}

TEST_F(BlockProjectTest, CancelledSearchLeavesEverythingAsItWas) {
    InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    project.Params().SetMinSequences(5);
    const std::vector<std::uint8_t> before = project.ToBytes();
    const bool couldUndo = project.CanUndo();
    auto cancelled = [](CSearchJob& job) {
        job.result.Clear();  // a partial result, thrown away
        return false;
    };
    const std::vector<const CSxMolX*> two = {project.MoleculeAt(0), project.MoleculeAt(1)};
    EXPECT_FALSE(project.Search(two, cancelled, prompt));
    EXPECT_EQ(project.ToBytes(), before);
    EXPECT_EQ(project.CanUndo(), couldUndo);
    EXPECT_EQ(project.Params().MinSequences(), 5);
}

TEST_F(BlockProjectTest, CompleteSearchInstallsColouredBlocksAndRestartsTheHistory) {
    InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    project.Params().SetPalette({0x11, 0x22});
    ASSERT_TRUE(project.Search(project.AllMolecules(), RunSearchJob, prompt));
    EXPECT_FALSE(project.HasLinks());
    EXPECT_FALSE(project.CanUndo());
    EXPECT_FALSE(project.Undo());
    EXPECT_EQ(project.History().Count(), 1);
    // Three molecules against a minimum of 5: the search ran with 3, and 3 stays.
    EXPECT_EQ(project.Params().MinSequences(), 3);
    const CSimBlockSet& blocks = project.BlockSet();
    EXPECT_EQ(blocks.MinSequences(), 3);
    ASSERT_GE(blocks.BlockCount(), 1);
    for (int b = 0; b < blocks.BlockCount(); ++b) {
        EXPECT_EQ(blocks.BlockAt(b)->Colour(), b % 2 ? 0x22u : 0x11u);
    }
    EXPECT_EQ(blocks.MoleculeCount(), 3);
    EXPECT_EQ(project.BlockMoleculeAt(2), project.MoleculeAt(2));
}

TEST_F(BlockProjectTest, LoweredMinimumNeverGoesBelowTwo) {
    const std::vector<const CSxMolX*> one = {project.MoleculeAt(0)};
    ASSERT_TRUE(project.Search(
        one, [](CSearchJob&) { return true; }, prompt));
    EXPECT_EQ(project.Params().MinSequences(), 2);
    // So the project still saves and opens.
    EXPECT_TRUE(CBlockProject::FromBytes(project.ToBytes()));
}

TEST_F(BlockProjectTest, TooManyMoleculesAreRefusedBeforeTheSearchRuns) {
    std::vector<const CSxMolX*> many(65, project.MoleculeAt(0));
    bool ran = false;
    EXPECT_FALSE(project.Search(
        many, [&ran](CSearchJob&) { return ran = true; }, prompt));
    EXPECT_FALSE(ran);
    ASSERT_EQ(prompt.Messages().size(), 1u);
}

TEST_F(BlockProjectTest, LinkOperationAfterTwoUndosDropsTheUndoneSnapshots) {
    InstallBlocks(project, {});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    const std::string afterFirst = Texts();
    ASSERT_TRUE(Link({{"alpha", 17, 22}, {"beta", 11, 16}}));
    ASSERT_TRUE(Link({{"alpha", 0, 4}, {"gamma", 2, 6}}));
    EXPECT_EQ(Texts(),
              "--MKVLaATWWGHdeklmnPQRST\n"
              "-------ATWWGH------PQRSTvv\n"
              "ggMKVLaatwwghde\n");
    EXPECT_FALSE(project.CanRedo());
    ASSERT_TRUE(project.Undo());
    ASSERT_TRUE(project.Undo());
    EXPECT_EQ(Texts(), afterFirst);
    ASSERT_TRUE(Link({{"alpha", 0, 4}, {"gamma", 2, 6}}));
    EXPECT_FALSE(project.CanRedo());
    EXPECT_EQ(project.History().Count(), 3);
    ASSERT_TRUE(project.Undo());
    EXPECT_EQ(Texts(), afterFirst);
}

TEST_F(BlockProjectTest, RefusedLinkShowsItsMessageAndChangesNothing) {
    InstallBlocks(project, {});
    std::vector<ALN_BSEL_ENTRY> columns;
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}, &columns));
    EXPECT_EQ(columns, (std::vector<ALN_BSEL_ENTRY>{{"alpha", 5, 11}, {"beta", 5, 11}}));
    const int snapshots = project.History().Count();
    // Before the link in alpha, after it in beta.
    EXPECT_FALSE(Link({{"alpha", 0, 4}, {"beta", 11, 15}}));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text, "Block can not be linked.");
    EXPECT_EQ(project.History().Count(), snapshots);
    EXPECT_EQ(project.Links().Count(), 1);
    // A selection of one row does nothing.
    EXPECT_FALSE(Link({{"alpha", 17, 22}}));
    EXPECT_EQ(prompt.Messages().size(), 1u);
}

TEST_F(BlockProjectTest, UnlinkAndUnlinkAllPushTheNewState) {
    InstallBlocks(project, {});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    EXPECT_FALSE(project.Unlink(std::vector<ALN_BSEL_ENTRY>{{"gamma", 0, 10}}));
    EXPECT_EQ(project.History().Count(), 2);
    const std::vector<ALN_BSEL_ENTRY> middleOfBeta = {{"beta", 6, 8}};
    ASSERT_TRUE(project.Unlink(middleOfBeta));
    EXPECT_EQ(project.Links().Count(), 2);
    EXPECT_EQ(project.History().Count(), 3);
    project.UnlinkAll();
    EXPECT_FALSE(project.HasLinks());
    ASSERT_TRUE(project.Undo());
    EXPECT_EQ(project.Links().Count(), 2);
}

TEST_F(BlockProjectTest, DefinedBlocksAreScoredNamedAndColoured) {
    InstallBlocks(project, {{{0, 2}, {0, 2}, 4, 0}});
    project.Params().SetPalette({0x1, 0x2, 0x3});
    const CSimBlock* block =
        project.DefineBlock(std::vector<ALN_BSEL_ENTRY>{{"alpha", 5, 11}, {"beta", 0, 6}});
    ASSERT_TRUE(block);
    EXPECT_EQ(block->Name(), "ud1");
    EXPECT_EQ(block->Flag(), 1);
    EXPECT_EQ(block->Width(CSimBlock::kOriginal), 6);
    // ATWWGH against itself with BLOSUM62: 4 + 5 + 11 + 11 + 6 + 8.
    EXPECT_EQ(block->Score(CSimBlock::kOriginal), 45);
    EXPECT_EQ(block->Colour(), 0x3u);  // two blocks now: palette entry 2
    EXPECT_EQ(project.BlockSet().BlockCount(), 2);

    project.BlockSet().FindBlock(block->Identifier())->SetName("my ud7 block");
    const CSimBlock* next =
        project.DefineBlock(std::vector<ALN_BSEL_ENTRY>{{"gamma", 2, 6}, {"alpha", 0, 4}});
    ASSERT_TRUE(next);
    EXPECT_EQ(next->Name(), "ud8");
    EXPECT_EQ(next->Member(0), 2);
    EXPECT_EQ(next->Start(CSimBlock::kOriginal, 1), 0);
    EXPECT_FALSE(project.DefineBlock(std::vector<ALN_BSEL_ENTRY>{{"alpha", 0, 4}}));
}

TEST_F(BlockProjectTest, DeletingAMoleculeDismissesItsBlocksAndRenumbersTheRest) {
    InstallBlocks(project,
                  {{{0, 1}, {5, 0}, 6, 45}, {{1, 2}, {0, 7}, 6, 45}, {{0, 2}, {0, 2}, 4, 20}});
    ASSERT_TRUE(Link({{"alpha", 0, 4}, {"gamma", 2, 6}}));
    EXPECT_EQ(project.DeleteQuestion("beta"),
              "Are you sure you want to delete 'beta' from the project?\n"
              "(all blocks it participates in will be dismissed)");
    project.DeleteMolecule("beta");
    EXPECT_EQ(project.MoleculeCount(), 2);
    ASSERT_EQ(project.BlockSet().BlockCount(), 1);
    const CSimBlock* left = project.BlockSet().BlockAt(0);
    EXPECT_EQ(left->Member(0), 0);
    EXPECT_EQ(left->Member(1), 1);
    EXPECT_EQ(project.BlockMoleculeAt(1)->Name(), "gamma");
    // The link between alpha and gamma now names gamma by its new entry index.
    EXPECT_EQ(Texts(), "--MKVLaatwwghdeklmnpqrst\nggMKVLaatwwghde\n");
    EXPECT_FALSE(project.CanUndo());
    // A molecule in the set but in no block gets the question without the second line.
    project.BlockSet().ClearBlocks();
    EXPECT_EQ(project.DeleteQuestion("gamma"),
              "Are you sure you want to delete 'gamma' from the project?");
    project.DeleteMolecule("nobody");
    EXPECT_EQ(project.MoleculeCount(), 2);
}

TEST_F(BlockProjectTest, RenamedMoleculesStayInTheirBlocksAndLinks) {
    InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    EXPECT_TRUE(project.RenameMolecule("alpha", "alpha", prompt));
    EXPECT_FALSE(project.RenameMolecule("alpha", "beta", prompt));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text,
              "Illegal name. Molecule with the name \"beta\" already exists in the project.");
    ASSERT_TRUE(project.RenameMolecule("alpha", "first one", prompt));
    EXPECT_EQ(project.BlockMoleculeAt(0)->Name(), "first one");
    EXPECT_EQ(project.MoleculeUse("first one"), CSimBlockSet::kInBlocks);
    const CAlignmentLayout layout = project.Layout();
    EXPECT_EQ(layout.DisplaySeqOf(layout.IndexOfRow("first one")).Text(), "mkvlaATWWGHdeklmnpqrst");
    const CMsfExport msf = project.BuildMsf();
    EXPECT_EQ(msf.Entries()[0].name, "first one");
}

TEST_F(BlockProjectTest, CopiesGetNewKeysAndTheirBlocksFollowThem) {
    InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}, {{0, 2}, {0, 2}, 4, 20}});
    ASSERT_TRUE(Link({{"alpha", 5, 11}, {"beta", 0, 6}}));
    const CBlockProject copy(project);
    ASSERT_EQ(copy.MoleculeCount(), 3);
    for (int i = 0; i < 3; ++i) {
        EXPECT_NE(copy.MoleculeAt(i)->Key(), project.MoleculeAt(i)->Key());
        EXPECT_EQ(copy.BlockMoleculeAt(i), copy.MoleculeAt(i));
        EXPECT_EQ(copy.MoleculeAt(i)->Sequence(), project.MoleculeAt(i)->Sequence());
    }
    ASSERT_EQ(copy.BlockSet().BlockCount(), 2);
    for (int b = 0; b < 2; ++b)
        EXPECT_EQ(*copy.BlockSet().BlockAt(b), *project.BlockSet().BlockAt(b));
    EXPECT_EQ(copy.Links(), project.Links());
    EXPECT_EQ(copy.History().Position(), project.History().Position());
    EXPECT_EQ(copy.MoleculeUse("beta"), CSimBlockSet::kInBlocks);
}

// A file that cannot be read at all keeps the fixed first line and names the file and why.
TEST_F(BlockProjectTest, UnreadableFilesAreReportedWithTheFileAndTheReason) {
    std::filesystem::create_directories(dir.File("folder.fa"));
    const std::string binary = dir.Write("binary.fa", std::string(">x\nMKV\0\x01LL\n", 12));
    const std::pair<std::string, std::string> cases[] = {
        {dir.File("missing.fa"), "No such file or directory"},
        {dir.File("folder.fa"), "is a folder, not a file"},
        {binary, "not a sequence file"},
    };
    for (const auto& [path, reason] : cases) {
        CRecordingPrompt recorder;
        EXPECT_FALSE(project.AddFile(path, recorder)) << path;
        ASSERT_EQ(recorder.Messages().size(), 1u) << path;
        EXPECT_EQ(recorder.Messages()[0].text,
                  "CMolListException occured\n" + path + ": " + reason);
    }
    if (::geteuid() != 0) {  // root reads any file
        const std::string locked = dir.Write("locked.fa", ">x\nMKV\n");
        std::filesystem::permissions(locked, std::filesystem::perms::none);
        CRecordingPrompt recorder;
        EXPECT_FALSE(project.AddFile(locked, recorder));
        ASSERT_EQ(recorder.Messages().size(), 1u);
        EXPECT_EQ(recorder.Messages()[0].text,
                  "CMolListException occured\n" + locked + ": Permission denied");
    }
    EXPECT_EQ(project.MoleculeCount(), 3);
}

}  // namespace
