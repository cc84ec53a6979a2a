// Damaged projects, written byte for byte as a damaged file could hold them: what loads must be
// usable, save, and load again; what cannot be is refused with a message naming the fault.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>
#include <optional>
#include <random>

#include "ProjectFixtures.h"
#include "archive/FileIO.h"

namespace {

struct CMoleculeFields {
    std::string name;
    std::string key;
    std::string sequence;
};

struct CBlockFields {
    std::vector<std::int32_t> members;
    std::vector<std::int32_t> starts;
    int width = 0;
    // The current layout; empty means the same as the original one.
    std::vector<std::int32_t> currentStarts{};
    std::optional<int> currentWidth{};
    std::vector<int> excluded{};  // member indices the current layout leaves out
};

struct CStretchFields {
    int molecule;
    int position;
    int length;
};

// What a project file holds, each part as given.
struct CProjectFields {
    std::vector<CMoleculeFields> molecules;
    std::vector<CMoleculeFields> entries;
    std::vector<CBlockFields> blocks;
    std::vector<std::vector<CStretchFields>> links;
    double expectationLimit = 0.0001;
};

// A molecule record with the key it is given (CSxMolX makes its own).
class CRawMolecule : public CSerializable {
  public:
    static constexpr const char* kClassTag = "SxMolX";
    const char* ClassTag() const override { return kClassTag; }
    explicit CRawMolecule(const CMoleculeFields& fields) : m_key(fields.key) {
        m_molecule.SetKind(kKindProtein);
        m_molecule.SetName(fields.name);
        m_molecule.SetSequence(fields.sequence);
    }
    void Serialize(CArchive& ar) override {
        ar.XData(m_molecule);
        ar.XMember(m_key);
    }

  private:
    CSxMol m_molecule;
    std::string m_key;
};

class CRawMolList : public CSerializable {
  public:
    static constexpr const char* kClassTag = "MolList";
    const char* ClassTag() const override { return kClassTag; }
    void Serialize(CArchive& ar) override {
        std::int32_t type = kTypeProtein;
        ar.XMember(type);
        ar.XObjectList(molecules);
    }
    std::vector<std::unique_ptr<CRawMolecule>> molecules;
};

// Links as given: CLinkList would merge or refuse them.
class CRawLinkList : public CSerializable {
  public:
    static constexpr const char* kClassTag = "LinkList";
    const char* ClassTag() const override { return kClassTag; }
    void Serialize(CArchive& ar) override { ar.XObjectList(links); }
    std::vector<std::unique_ptr<CLink>> links;
};

class CRawProject : public CSerializable {
  public:
    static constexpr const char* kClassTag = CBlockProject::kClassTag;
    const char* ClassTag() const override { return kClassTag; }
    explicit CRawProject(const CProjectFields& fields)
        : m_molecules(std::make_unique<CRawMolList>()) {
        m_params.SetExpectationLimit(fields.expectationLimit);
        for (const CMoleculeFields& molecule : fields.molecules)
            m_molecules->molecules.push_back(std::make_unique<CRawMolecule>(molecule));
        for (const CMoleculeFields& entry : fields.entries)
            m_blockSet.AddMolecule(CSxMolEntry(entry.key, entry.name, entry.sequence));
        for (const CBlockFields& fields : fields.blocks)
            m_blockSet.AddBlockSorted(BlockOf(fields));
        for (const auto& stretches : fields.links) {
            auto link = std::make_unique<CLink>(0);
            for (const CStretchFields& stretch : stretches) {
                link->AddMolecule(stretch.molecule, stretch.position, stretch.length, 0);
                link->SetColumn(std::max(link->Column(), stretch.position));
            }
            m_links.links.push_back(std::move(link));
        }
    }
    void Serialize(CArchive& ar) override {
        ar.XData(m_params);
        ar.XPointer(m_molecules);
        ar.XData(m_blockSet);
        ar.XData(m_links);
    }

  private:
    static std::unique_ptr<CSimBlock> BlockOf(const CBlockFields& fields) {
        auto block = std::make_unique<CSimBlock>();
        block->Init(fields.members, fields.starts, fields.width, 10, 0);
        for (std::size_t i = 0; i < fields.currentStarts.size(); ++i)
            block->SetCurrentStart(static_cast<int>(i), fields.currentStarts[i]);
        if (fields.currentWidth)
            block->SetCurrentWidth(*fields.currentWidth);
        for (int excluded : fields.excluded)
            block->SetIncluded(excluded, false);
        return block;
    }

    CQuilterParams m_params;
    std::unique_ptr<CRawMolList> m_molecules;
    CSimBlockSet m_blockSet;
    CRawLinkList m_links;
};

std::vector<std::uint8_t> BytesOf(const CProjectFields& fields) {
    CArchive ar = CArchive::ForWriting();
    std::string tag = CBlockProject::kFileTag;
    ar.XMember(tag);
    auto raw = std::make_unique<CRawProject>(fields);
    ar.XPointer(raw);
    return ar.Bytes();
}

// Three molecules, their entries, one block over alpha and beta and a link holding it.
CProjectFields Sound() {
    CProjectFields fields;
    fields.molecules = {{"alpha", "A1", "mkvlaatwwghdeklmnpqrst"},
                        {"beta", "B2", "atwwghpqrstvv"},
                        {"gamma", "C3", "ggmkvlaatwwghde"}};
    fields.entries = fields.molecules;
    fields.blocks = {{{0, 1}, {5, 0}, 6}};
    fields.links = {{{0, 5, 6}, {1, 0, 6}}};
    return fields;
}

// The reason a project is refused, or "" when it loads.
std::string Refusal(const CProjectFields& fields) {
    try {
        return CBlockProject::FromBytes(BytesOf(fields)) ? "" : "not a project";
    } catch (const CArchiveException& e) {
        return e.what();
    }
}

MATCHER_P(Mentions, text, "") {
    return arg.find(text) != std::string::npos;
}

TEST(ProjectValidation, TheSoundProjectLoadsAndSavesTheSameBytes) {
    const std::vector<std::uint8_t> bytes = BytesOf(Sound());
    const std::unique_ptr<CBlockProject> project = CBlockProject::FromBytes(bytes);
    ASSERT_TRUE(project);
    EXPECT_EQ(project->BlockSet().BlockCount(), 1);
    EXPECT_EQ(project->Links().Count(), 1);
    EXPECT_EQ(project->ToBytes(), bytes);
}

TEST(ProjectValidation, BlocksOutsideTheirMoleculesAreRefused) {
    CProjectFields empty = Sound();
    empty.molecules[2].sequence = empty.entries[2].sequence = "";
    empty.blocks.push_back({{0, 2}, {0, 0}, 3});
    EXPECT_THAT(Refusal(empty), Mentions("block 2 reaches past the end of \"gamma\" (0 residues)"));

    CProjectFields tooShort = Sound();
    tooShort.blocks[0].starts = {5, 8};  // beta has 13 residues: 8 + 6 > 13
    EXPECT_THAT(Refusal(tooShort), Mentions("reaches past the end of \"beta\" (13 residues)"));
    tooShort.blocks[0].starts = {5, 7};  // ends on beta's last residue
    tooShort.links.clear();
    EXPECT_EQ(Refusal(tooShort), "");

    CProjectFields current = Sound();
    current.blocks[0].currentStarts = {5, 10};
    EXPECT_THAT(Refusal(current), Mentions("past the end of \"beta\""));
    // A member the current layout leaves out may stand anywhere in range.
    current.blocks[0].excluded = {1};
    EXPECT_EQ(Refusal(current), "");
    current.blocks[0].currentStarts = {5, -1};
    EXPECT_THAT(Refusal(current), Mentions("block 1 starts at -1"));
}

TEST(ProjectValidation, BlockMembersAndWidthsMustMakeSense) {
    const std::vector<std::pair<CBlockFields, std::string>> cases = {
        {{{0, 3}, {0, 0}, 4}, "names a molecule entry the project does not hold"},
        {{{-1, 0}, {0, 0}, 4}, "names a molecule entry the project does not hold"},
        {{{1, 1}, {0, 2}, 4}, "holds \"beta\" twice"},
        {{{0, 1}, {0, 0}, 0}, "has a width of 0"},
        {{{0, 1}, {0, 0}, -3}, "has a width of -3"},
        {{{0, 1}, {0, 0}, 4, {}, 0}, "has a width of 0"},
        {{{}, {}, 4}, "has no members"},
    };
    for (const auto& [block, message] : cases) {
        CProjectFields fields = Sound();
        fields.blocks.push_back(block);
        EXPECT_THAT(Refusal(fields), Mentions(message)) << message;
    }
}

TEST(ProjectValidation, LinksMustNameShownMoleculesWithinTheirResidues) {
    CProjectFields unknown = Sound();
    unknown.links = {{{0, 0, 3}, {5, 0, 3}}};
    EXPECT_THAT(Refusal(unknown), Mentions("link 1 names a molecule the project does not hold"));

    // An entry whose molecule is not in the project: blocks may keep it, links may not.
    CProjectFields orphan = Sound();
    orphan.entries.push_back({"delta", "D4", "mkvlaa"});
    orphan.blocks.push_back({{0, 3}, {0, 0}, 4});
    EXPECT_EQ(Refusal(orphan), "");
    orphan.links.push_back({{0, 14, 3}, {3, 0, 3}});
    EXPECT_THAT(Refusal(orphan), Mentions("link 2 names a molecule the project does not hold"));

    CProjectFields pastEnd = Sound();
    pastEnd.links = {{{0, 20, 3}, {2, 12, 3}}};  // alpha has 22 residues
    EXPECT_THAT(Refusal(pastEnd), Mentions("link 1 reaches past the end of \"alpha\""));
    pastEnd.links = {{{0, 19, 3}, {2, 12, 3}}};
    EXPECT_EQ(Refusal(pastEnd), "");
}

TEST(ProjectValidation, MoleculesAndEntriesMustBeTellableApart) {
    const std::vector<std::pair<std::function<void(CProjectFields&)>, std::string>> cases = {
        {[](CProjectFields& fields) { fields.molecules[2].name = "alpha"; },
         "two molecules are named \"alpha\""},
        {[](CProjectFields& fields) { fields.molecules[1].name = ""; }, "molecule 2 has no name"},
        {[](CProjectFields& fields) { fields.molecules[2].key = "A1"; },
         "two molecules share the key A1"},
        {[](CProjectFields& fields) { fields.entries[2].key = "B2"; },
         "two block entries name the molecule"},
        // The alignment shows the molecule's residues where the entry's are counted.
        {[](CProjectFields& fields) { fields.entries[1].sequence += "kkkk"; },
         "the block entry of \"beta\" differs in length"},
    };
    for (const auto& [damage, message] : cases) {
        CProjectFields fields = Sound();
        damage(fields);
        EXPECT_THAT(Refusal(fields), Mentions(message)) << message;
    }
}

TEST(ProjectValidation, ExpectationLimitsMustBePositiveNumbers) {
    for (double limit : {std::nan(""), -1.0, 0.0, std::numeric_limits<double>::infinity(),
                         -std::numeric_limits<double>::infinity()}) {
        CProjectFields fields = Sound();
        fields.expectationLimit = limit;
        EXPECT_THAT(Refusal(fields), Mentions("search values outside their limits")) << limit;

        CQuilterParams params;
        params.SetExpectationLimit(limit);
        EXPECT_THROW(CQuilterParams().ReadTemplateBytes(params.TemplateBytes()), CArchiveException)
            << limit;
    }
    CProjectFields tiny = Sound();
    tiny.expectationLimit = 1e-300;
    EXPECT_EQ(Refusal(tiny), "");
}

TEST(ProjectValidation, OpenReportsTheFileAndTheFault) {
    CScratchDir dir("tb_project_validation");
    CProjectFields fields = Sound();
    fields.blocks[0].members = {0, 7};
    const std::vector<std::uint8_t> bytes = BytesOf(fields);
    const std::string path = dir.Write("damaged.bpr", std::string(bytes.begin(), bytes.end()));
    CBlockProject project;
    CRecordingPrompt prompt;
    EXPECT_EQ(project.Open(path, prompt), CBlockProject::kOpenFailed);
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_THAT(prompt.Messages()[0].text, ::testing::StartsWith("damaged.bpr\n"));
    EXPECT_THAT(prompt.Messages()[0].text, Mentions("block 1 names a molecule entry"));
    EXPECT_EQ(project.MoleculeCount(), 0);
}

TEST(ProjectValidation, AProjectThatWouldNotReadBackNeverReplacesAFile) {
    CScratchDir dir("tb_project_validation");
    std::unique_ptr<CBlockProject> project = CBlockProject::FromBytes(BytesOf(Sound()));
    ASSERT_TRUE(project);
    const std::string path = dir.Write("kept.bpr", "previous");
    project->BlockSet().BlockAt(0)->SetCurrentWidth(40);
    try {
        project->Save(path);
        ADD_FAILURE() << "saved";
    } catch (const CFileException& e) {
        EXPECT_EQ(e.Path(), path);
        EXPECT_THAT(e.Reason(), Mentions("would not read back"));
        EXPECT_THAT(e.Reason(), Mentions("past the end of"));
    }
    const std::vector<std::uint8_t> kept = ReadWholeFile(path);
    EXPECT_EQ(std::string(kept.begin(), kept.end()), "previous");
}

// Random projects, most of them damaged somewhere: each either is refused or survives the
// commands the program runs on a project and then saves and loads again.
CProjectFields RandomProject(std::mt19937& random) {
    auto pick = [&](int low, int high) {
        return std::uniform_int_distribution<int>(low, high)(random);
    };
    CProjectFields fields;
    const int molecules = pick(1, 4);
    for (int i = 0; i < molecules; ++i) {
        std::string sequence(static_cast<std::size_t>(pick(0, 12)), 'a');
        for (char& residue : sequence)
            residue = "acdefghiklmnpqrstvwy"[pick(0, 19)];
        fields.molecules.push_back(
            {"m" + std::to_string(pick(0, 5)), "K" + std::to_string(pick(0, 5)), sequence});
    }
    for (const CMoleculeFields& molecule : fields.molecules) {
        CMoleculeFields entry = molecule;
        if (pick(0, 5) == 0)
            entry.key = "K" + std::to_string(pick(0, 5));
        if (pick(0, 5) == 0)
            entry.sequence.resize(static_cast<std::size_t>(pick(0, 12)), 'w');
        if (pick(0, 5) > 0)
            fields.entries.push_back(entry);
    }
    const int entries = static_cast<int>(fields.entries.size());
    for (int b = pick(0, 3); b > 0; --b) {
        CBlockFields block;
        for (int m = pick(1, 3); m > 0; --m) {
            block.members.push_back(pick(-1, entries));
            block.starts.push_back(pick(-1, 10));
        }
        block.width = pick(0, 6);
        if (pick(0, 2) == 0) {
            block.currentWidth = pick(0, 6);
            for (std::size_t m = 0; m < block.members.size(); ++m)
                block.currentStarts.push_back(pick(-1, 10));
        }
        if (pick(0, 2) == 0)
            block.excluded.push_back(0);
        fields.blocks.push_back(block);
    }
    for (int l = pick(0, 2); l > 0; --l) {
        std::vector<CStretchFields> link;
        for (int k = pick(1, 3); k > 0; --k)
            link.push_back({pick(0, entries), pick(0, 10), pick(0, 5)});
        fields.links.push_back(link);
    }
    return fields;
}

// Link, unlink, define a block over the first columns of every row, delete a molecule.
void RunCommands(CBlockProject& project) {
    const CAlignmentLayout layout = project.Layout();
    std::vector<ALN_BSEL_ENTRY> rows;
    for (int r = 0; r < layout.RowCount(); ++r)
        rows.push_back({layout.RowAt(r).name, 1, 4});
    CRecordingPrompt prompt;
    project.Link(rows, prompt);
    project.DefineBlock(rows);
    project.Unlink(std::span(rows).first(std::min<std::size_t>(rows.size(), 1)));
    project.BuildMsf();
    if (project.MoleculeCount() > 2)
        project.DeleteMolecule(project.MoleculeAt(1)->Name());
}

TEST(ProjectValidation, EveryProjectThatLoadsSavesAndLoadsAgain) {
    CScratchDir dir("tb_project_validation");
    const std::string path = dir.File("again.bpr");
    std::mt19937 random(20261207);
    int loaded = 0;
    for (int trial = 0; trial < 3000; ++trial) {
        const CProjectFields fields = RandomProject(random);
        std::unique_ptr<CBlockProject> project;
        try {
            project = CBlockProject::FromBytes(BytesOf(fields));
        } catch (const CArchiveException&) {
            continue;
        }
        ASSERT_TRUE(project);
        ++loaded;
        RunCommands(*project);
        ASSERT_NO_THROW(project->Save(path)) << "trial " << trial;
        std::unique_ptr<CBlockProject> again;
        ASSERT_NO_THROW(again = CBlockProject::Load(path)) << "trial " << trial;
        EXPECT_EQ(again->ToBytes(), project->ToBytes());
    }
    // Both kinds occur often enough for the property to mean something.
    EXPECT_GT(loaded, 100);
    EXPECT_LT(loaded, 2900);
}

}  // namespace
