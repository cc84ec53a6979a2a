#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <string>

#include "layout/AlignmentLayout.h"
#include "layout/Selection.h"
#include "links/LinkHistory.h"
#include "links/LinkList.h"

namespace {

struct Stretch {
    int molecule;
    int position;
    int length;
    int offset = 0;
};

std::unique_ptr<CLink> MakeLink(int column, std::initializer_list<Stretch> stretches) {
    auto link = std::make_unique<CLink>(column);
    for (const Stretch& s : stretches)
        link->AddMolecule(s.molecule, s.position, s.length, s.offset);
    return link;
}

// "molecule:position+length" for every stretch of every link, with the link's column.
std::string Describe(const CLinkList& links) {
    std::string text;
    for (const auto& link : links) {
        text += "@" + std::to_string(link->Column()) + "[";
        for (int k = 0; k < link->MoleculeCount(); ++k) {
            text += (k ? " " : "") + std::to_string(link->Molecule(k)) + ":" +
                    std::to_string(link->Position(k)) + "+" + std::to_string(link->Length(k));
        }
        text += "]";
    }
    return text;
}

CAlignmentLayout LayoutOf(const CLinkList& links, int rows, int length) {
    std::vector<CAlignmentRowSource> sources;
    for (int r = 0; r < rows; ++r) {
        sources.push_back({"m" + std::to_string(r), std::string(length, 'a'), r});
    }
    return CAlignmentLayout(std::move(sources), links);
}

TEST(LinkList, LinkingTheSameStretchesTwiceLeavesOneLink) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(12, {{0, 12, 8}, {1, 3, 8}})));
    const std::string once = Describe(links);
    ASSERT_TRUE(links.Add(MakeLink(12, {{0, 12, 8}, {1, 3, 8}})));
    EXPECT_EQ(links.Count(), 1);
    EXPECT_EQ(Describe(links), once);
    EXPECT_EQ(once, "@12[0:12+8 1:3+8]");
}

TEST(LinkList, CrossingLinkIsRefusedAndChangesNothing) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(10, {{0, 10, 5}, {1, 10, 5}})));
    const std::string before = Describe(links);
    // Later in molecule 0, earlier in molecule 1.
    EXPECT_FALSE(links.Add(MakeLink(30, {{0, 30, 5}, {1, 2, 5}})));
    EXPECT_EQ(Describe(links), before);
    EXPECT_STREQ(kCannotLinkMessage, "Block can not be linked.");
}

TEST(LinkList, LinksThatWouldFormACycleAcrossThreeRowsAreRefused) {
    // Pairwise each new link is consistent with each old one, but together the rows would
    // have to run backwards: 0 before 1 in row a, 1 before 2 in row b, 2 before 0 in row c.
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 3}, {2, 20, 3}})));   // link P: rows 0 and 2
    ASSERT_TRUE(links.Add(MakeLink(10, {{0, 10, 3}, {1, 0, 3}})));  // link Q: after P in row 0
    const std::string before = Describe(links);
    // Link R after Q in row 1 but before P in row 2.
    EXPECT_FALSE(links.Add(MakeLink(10, {{1, 10, 3}, {2, 0, 3}})));
    EXPECT_EQ(Describe(links), before);
}

TEST(LinkList, OverlapIsMergedTheSameWhicheverLinkCameFirst) {
    // Rows 0 and 1 linked over residues 0..9; rows 1 and 2 over residues 5..14 of row 1.
    const std::string expected = "@0[0:0+5 1:0+5]@5[1:5+10 2:0+10 0:5+5]";
    {
        CLinkList links;
        ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 10}, {1, 0, 10}})));
        ASSERT_TRUE(links.Add(MakeLink(5, {{1, 5, 10, 0}, {2, 0, 10, 5}})));
        EXPECT_EQ(Describe(links), expected);
    }
    {
        CLinkList links;
        ASSERT_TRUE(links.Add(MakeLink(5, {{1, 5, 10, 0}, {2, 0, 10, 5}})));
        ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 10}, {1, 0, 10}})));
        EXPECT_EQ(Describe(links), expected);
    }
}

TEST(LinkList, TakenOverPartKeepsItsResiduesWhenTheSelectionSpannedGaps) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(10, {{0, 10, 10}, {1, 0, 10, 10}})));
    // Row 1 now starts with 10 gap columns. Select columns 5..24 of rows 1 and 2: row 1 has 15
    // residues there (its first 5 columns are gaps), row 2 has 20.
    const CAlignmentLayout layout = LayoutOf(links, 3, 40);
    const std::vector<ALN_BSEL_ENTRY> selection = {{"m1", 5, 25}, {"m2", 5, 25}};
    auto request = MakeLinkRequest(layout, selection);
    ASSERT_TRUE(request);
    EXPECT_EQ(request->Column(), 5);
    EXPECT_EQ(request->Position(0), 0);
    EXPECT_EQ(request->Length(0), 15);
    EXPECT_EQ(request->Position(1), 5);
    EXPECT_EQ(request->Length(1), 20);
    ASSERT_TRUE(links.Add(std::move(request)));
    // The first link is absorbed whole (offset 0); row 0 keeps its 10 residues in the merged link.
    EXPECT_EQ(Describe(links), "@10[1:0+15 2:5+20 0:10+10]");
}

TEST(LinkList, SelectedWidthsTenFiveAndSevenMakeALinkOfWidthSeven) {
    CLinkList none;
    const CAlignmentLayout layout = LayoutOf(none, 3, 30);
    const std::vector<ALN_BSEL_ENTRY> selection = {{"m0", 2, 12}, {"m1", 7, 2}, {"m2", 2, 9}};
    auto request = MakeLinkRequest(layout, selection);
    ASSERT_TRUE(request);
    EXPECT_EQ(request->Column(), 2);
    EXPECT_EQ(request->LongestLength(), 7);
    EXPECT_EQ(request->Length(0), 7);
    EXPECT_EQ(request->Length(1), 5);
    EXPECT_EQ(request->Length(2), 7);
}

TEST(LinkList, RequestsNeedEnoughRowsOfBlockSetMolecules) {
    CLinkList none;
    std::vector<CAlignmentRowSource> sources = {
        {"a", "aaaaaaaaaa", 0}, {"b", "aaaaaaaaaa", -1}, {"c", "aaaaaaaaaa", 1}};
    const CAlignmentLayout layout(sources, none);
    const std::vector<ALN_BSEL_ENTRY> oneKnownRow = {{"a", 0, 5}, {"b", 0, 5}, {"zz", 0, 5}};
    EXPECT_FALSE(MakeLinkRequest(layout, oneKnownRow));
    EXPECT_TRUE(MakeUnlinkRequest(layout, oneKnownRow));
    const std::vector<ALN_BSEL_ENTRY> sameRowTwice = {{"a", 0, 5}, {"a", 2, 7}};
    EXPECT_FALSE(MakeLinkRequest(layout, sameRowTwice));
    const std::vector<ALN_BSEL_ENTRY> emptyWidth = {{"a", 0, 5}, {"c", 3, 3}};
    EXPECT_FALSE(MakeLinkRequest(layout, emptyWidth));
    EXPECT_FALSE(MakeBlockRequest(layout, emptyWidth));
    // Past the end of the rows there are no residues to link.
    const std::vector<ALN_BSEL_ENTRY> pastTheEnd = {{"a", 12, 15}, {"c", 12, 15}};
    EXPECT_FALSE(MakeLinkRequest(layout, pastTheEnd));
}

TEST(LinkList, UnlinkingTheMiddleOfOneRowSplitsTheLink) {
    {
        // Two rows: the middle is left to one row, which cannot stay linked alone.
        CLinkList links;
        ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 20}, {1, 0, 20}})));
        auto request = MakeLink(0, {{0, 5, 5}});
        EXPECT_TRUE(links.Unlink(*request));
        EXPECT_EQ(Describe(links), "@0[0:0+5 1:0+5]@10[0:10+10 1:10+10]");
    }
    {
        // Three rows: the other two rows keep the middle linked.
        CLinkList links;
        ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 20}, {1, 0, 20}, {2, 0, 20}})));
        auto request = MakeLink(0, {{1, 5, 5}});
        EXPECT_TRUE(links.Unlink(*request));
        EXPECT_EQ(Describe(links),
                  "@0[0:0+5 1:0+5 2:0+5]@5[0:5+5 2:5+5]@10[0:10+10 1:10+10 2:10+10]");
    }
}

TEST(LinkList, UnlinkingOneOfTwoRowsRemovesTheLinkAndClosesTheGaps) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(8, {{0, 8, 4}, {1, 0, 4}})));
    ASSERT_TRUE(links.Add(MakeLink(20, {{0, 20, 4}, {1, 12, 4}, {2, 20, 4}})));
    EXPECT_EQ(Describe(links), "@8[0:8+4 1:0+4]@20[0:20+4 1:12+4 2:20+4]");
    auto request = MakeLink(0, {{1, 0, 4}});
    EXPECT_TRUE(links.Unlink(*request));
    EXPECT_EQ(Describe(links), "@20[0:20+4 1:12+4 2:20+4]");
    // An unlink that meets no linked residue changes nothing.
    auto elsewhere = MakeLink(0, {{2, 0, 10}});
    EXPECT_FALSE(links.Unlink(*elsewhere));
}

TEST(LinkList, ColumnsAreCompactedAndLaterLinksArePushed) {
    CLinkList links;
    // Asked for column 40, but the rows need only column 20.
    ASSERT_TRUE(links.Add(MakeLink(40, {{0, 10, 5}, {1, 20, 5}})));
    EXPECT_EQ(Describe(links), "@20[0:10+5 1:20+5]");
    // A later link on row 0 (and row 2) follows row 0's displacement of 10.
    ASSERT_TRUE(links.Add(MakeLink(0, {{0, 30, 5}, {2, 30, 5}})));
    EXPECT_EQ(Describe(links), "@20[0:10+5 1:20+5]@40[0:30+5 2:30+5]");
    // An earlier link that shifts row 1 by 15 pushes both links after it.
    ASSERT_TRUE(links.Add(MakeLink(0, {{1, 0, 5}, {3, 15, 5}})));
    EXPECT_EQ(Describe(links), "@15[1:0+5 3:15+5]@35[0:10+5 1:20+5]@55[0:30+5 2:30+5]");
}

TEST(LinkList, MoleculeRemovalDropsItsStretchesAndRenumbers) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(0, {{0, 0, 5}, {2, 0, 5}})));
    ASSERT_TRUE(links.Add(MakeLink(10, {{1, 10, 5}, {2, 10, 5}, {3, 10, 5}})));
    links.RemoveMolecule(2);
    EXPECT_EQ(Describe(links), "@10[1:10+5 2:10+5]");
}

TEST(LinkList, StoredLinksReadBackAndBadOnesAreRefused) {
    CLinkList links;
    ASSERT_TRUE(links.Add(MakeLink(3, {{0, 3, 4}, {1, 0, 4, 3}})));
    ASSERT_TRUE(links.Add(MakeLink(9, {{0, 9, 2}, {1, 6, 2}, {2, 1, 2, 8}})));
    CArchive out = CArchive::ForWriting();
    out.XData(links);
    CArchive in = CArchive::ForReading(out.Bytes());
    CLinkList read;
    in.XData(read);
    EXPECT_EQ(read, links);
    EXPECT_EQ(read.At(1).Offset(2), 8);

    // Stored links that claim the same residues of one row, or order two rows' stretches in
    // opposite ways, cannot be laid out.
    struct RawLinks {
        std::vector<std::unique_ptr<CLink>> links;
        void Serialize(CArchive& ar) { ar.XObjectList(links); }
    };
    auto refuses = [](std::unique_ptr<CLink> a, std::unique_ptr<CLink> b) {
        RawLinks raw;
        raw.links.push_back(std::move(a));
        raw.links.push_back(std::move(b));
        CArchive writer = CArchive::ForWriting();
        writer.XData(raw);
        CArchive reader = CArchive::ForReading(writer.Bytes());
        CLinkList target;
        try {
            reader.XData(target);
        } catch (const CArchiveException&) {
            return true;
        }
        return false;
    };
    EXPECT_TRUE(refuses(MakeLink(0, {{0, 0, 5}, {1, 0, 5}}), MakeLink(3, {{0, 3, 5}, {2, 0, 5}})));
    EXPECT_TRUE(refuses(MakeLink(0, {{0, 0, 5}, {1, 9, 5}}), MakeLink(9, {{0, 9, 5}, {1, 0, 5}})));
    EXPECT_FALSE(refuses(MakeLink(0, {{0, 0, 5}, {1, 0, 5}}), MakeLink(9, {{0, 9, 5}, {1, 9, 5}})));
}

// Every linked residue stands in its link's column and shows in upper case, no other residue
// does, every row keeps all its residues in order, and no link could move left.
void ExpectExactLayout(const CLinkList& links, int rows, int length) {
    const CAlignmentLayout layout = LayoutOf(links, rows, length);
    std::vector<int> linkedResidues(rows, 0);
    int previousColumn = 0;
    for (const auto& link : links) {
        EXPECT_GE(link->Column(), previousColumn);
        previousColumn = link->Column();
        bool pinned = link->Column() == 0;
        for (int k = 0; k < link->MoleculeCount(); ++k) {
            if (link->Length(k) == 0)
                continue;
            const CSegmentRow& row = layout.RowAt(link->Molecule(k)).segments;
            for (int i = 0; i < link->Length(k); ++i) {
                ASSERT_EQ(row.PositionToColumn(link->Position(k) + i), link->Column() + i)
                    << Describe(links);
            }
            linkedResidues[link->Molecule(k)] += link->Length(k);
            pinned = pinned || !row.IsGapColumn(link->Column() - 1);
        }
        EXPECT_TRUE(pinned) << "link could move left: " << Describe(links);
    }
    for (int r = 0; r < rows; ++r) {
        const std::string text = layout.DisplaySeqOf(r).Text();
        EXPECT_EQ(std::count(text.begin(), text.end(), 'A'), linkedResidues[r]);
        EXPECT_EQ(text.size() - std::count(text.begin(), text.end(), '-'),
                  static_cast<std::size_t>(length));
    }
}

TEST(LinkList, RandomLinkAndUnlinkOperationsKeepTheLayoutExact) {
    std::mt19937 random(20240611);
    int refused = 0;
    int added = 0;
    for (int trial = 0; trial < 300; ++trial) {
        const int rows = 2 + static_cast<int>(random() % 4);
        const int length = 15 + static_cast<int>(random() % 40);
        CLinkList links;
        for (int step = 0; step < 10; ++step) {
            const CAlignmentLayout layout = LayoutOf(links, rows, length);
            std::vector<ALN_BSEL_ENTRY> selection;
            for (int r = 0; r < rows; ++r) {
                if (random() % 3 == 0)
                    continue;
                const int start = static_cast<int>(random() % layout.ColumnCount());
                selection.push_back(
                    {"m" + std::to_string(r), start, start + 1 + static_cast<int>(random() % 12)});
            }
            selection = TrimSelection(layout, selection);
            const CLinkList before = links;
            if (random() % 4 != 0) {
                auto request = MakeLinkRequest(layout, selection);
                if (!request)
                    continue;
                if (links.Add(std::move(request))) {
                    ++added;
                } else {
                    ++refused;
                    EXPECT_EQ(links, before);
                }
            } else if (auto request = MakeUnlinkRequest(layout, selection)) {
                links.Unlink(*request);
            }
            ExpectExactLayout(links, rows, length);
            if (HasFatalFailure())
                return;
        }
    }
    // Both outcomes occur, so the checks above saw merged, pushed and refused links.
    EXPECT_GT(added, 500);
    EXPECT_GT(refused, 20);
}

}  // namespace
