#include <gtest/gtest.h>

#include <random>

#include "LayoutParser.h"

namespace {

constexpr int kPanes = 4;

std::string Canonical(const std::string& text) {
    const CLayoutParseResult result = ParseLayout(text, kPanes);
    return result.Ok() ? ComposeLayout(result.root) : "error: " + result.message;
}

TEST(LayoutParser, ReportsEachErrorWithItsMessage) {
    const struct {
        const char* input;
        int code;
        const char* message;
    } cases[] = {
        {"(0,1", kLayoutUnexpectedEnd, "Enexpected end of Layout string"},
        {"({0,1},{2", kLayoutUnexpectedEnd, "Enexpected end of Layout string"},
        {"(0,1}", kLayoutSyntaxError, "Syntax error"},
        {"0,1", kLayoutSyntaxError, "Syntax error"},
        {"", kLayoutSyntaxError, "Syntax error"},
        {"   ", kLayoutSyntaxError, "Syntax error"},
        {"(0,1))", kLayoutSyntaxError, "Syntax error"},
        {"(0,1)(2)", kLayoutSyntaxError, "Syntax error"},
        {"(0,1);", kLayoutSyntaxError, "Syntax error"},
        {"(0,4)", kLayoutWrongViewNumber, "Using wrong view number"},
        {"(0,99999999999999999999)", kLayoutWrongViewNumber, "Using wrong view number"},
        {"(0,0)", kLayoutDuplicateViewNumber, "Dublicate using view number"},
        {"({0,1},[2,1])", kLayoutDuplicateViewNumber, "Dublicate using view number"},
        {"(0;1)", kLayoutUnknownSymbol, "Unknow symbol `;`"},
        {"(0<x>,1)", kLayoutUnknownSymbol, "Unknow symbol `<`"},
        {"(0,1<>)", kLayoutUnknownSymbol, "Unknow symbol `<`"},
    };
    for (const auto& c : cases) {
        const CLayoutParseResult result = ParseLayout(c.input, kPanes);
        EXPECT_EQ(result.error, c.code) << c.input;
        EXPECT_EQ(result.message, c.message) << c.input;
    }
    EXPECT_EQ(LayoutErrorMessage(0x805), "Unknow error 0x805");
}

TEST(LayoutParser, FirstErrorWins) {
    // A duplicate before an unknown symbol, and a wrong number before the missing end.
    EXPECT_EQ(ParseLayout("(0,0;", kPanes).error, kLayoutDuplicateViewNumber);
    EXPECT_EQ(ParseLayout("(7,", kPanes).error, kLayoutWrongViewNumber);
    EXPECT_EQ(ParseLayout("(0,1;}", kPanes).error, kLayoutUnknownSymbol);
}

TEST(LayoutParser, BuildsTheDefaultAndTheTabbedLayouts) {
    const CLayoutParseResult standard = ParseLayout("({0,1},{2,3})", kPanes);
    ASSERT_TRUE(standard.Ok());
    ASSERT_EQ(standard.root.kind, kLayoutHorizontal);
    ASSERT_EQ(standard.root.children.size(), 2u);
    EXPECT_EQ(standard.root.children[0].kind, kLayoutVertical);
    EXPECT_EQ(PanesOf(standard.root.children[0]), (std::vector<int>{0, 1}));
    EXPECT_EQ(PanesOf(standard.root.children[1]), (std::vector<int>{2, 3}));

    const CLayoutParseResult tabs = ParseLayout("[0,{(1,2),3}]", kPanes);
    ASSERT_TRUE(tabs.Ok());
    ASSERT_EQ(tabs.root.kind, kLayoutTabular);
    ASSERT_EQ(tabs.root.children.size(), 2u);
    EXPECT_EQ(tabs.root.children[0].kind, 0);
    const CLayoutItem& second = tabs.root.children[1];
    ASSERT_EQ(second.kind, kLayoutVertical);
    ASSERT_EQ(second.children.size(), 2u);
    EXPECT_EQ(second.children[0].kind, kLayoutHorizontal);
    EXPECT_EQ(PanesOf(second.children[0]), (std::vector<int>{1, 2}));
    EXPECT_EQ(second.children[1].kind, 3);
}

TEST(LayoutParser, NormalisesGroups) {
    // Same kind as the parent: members move up, in order.
    EXPECT_EQ(Canonical("(0,(1,2),3)"), "(0,1,2,3)");
    EXPECT_EQ(Canonical("((0,1),2)"), "(0,1,2)");
    // Groups of one member or none give way to their members; empty tab groups vanish.
    EXPECT_EQ(Canonical("({0},1)"), "(0,1)");
    EXPECT_EQ(Canonical("(0,[],1)"), "(0,1)");
    EXPECT_EQ(Canonical("(0,{},1)"), "(0,1)");
    EXPECT_EQ(Canonical("(0,[{}],1)"), "(0,1)");
    // The outermost group of one member is replaced by it.
    EXPECT_EQ(Canonical("[(0,1)]"), "(0,1)");
    EXPECT_EQ(Canonical("({0,1})"), "{0,1}");
    const CLayoutParseResult lone = ParseLayout("(2)", kPanes);
    ASSERT_TRUE(lone.Ok());
    EXPECT_TRUE(lone.root.IsPane());
    EXPECT_EQ(lone.root.kind, 2);
    EXPECT_EQ(ComposeLayout(lone.root), "(2)");
    // An empty outermost group stays as it is.
    EXPECT_EQ(Canonical("{}"), "{}");
}

TEST(LayoutParser, SkipsBlanksCommasAndSizeSuffixes) {
    EXPECT_EQ(Canonical("( 0 , 1<200> )"), "(0,1)");
    EXPECT_EQ(Canonical("(0 1)"), "(0,1)");
    EXPECT_EQ(Canonical("(,,0,,1,)"), "(0,1)");
    EXPECT_EQ(Canonical("\t(0,\r\n{1,2}\x01,3)"), "(0,{1,2},3)");
    // Bytes from 128 on count as blanks.
    EXPECT_EQ(Canonical("(0,\xC3\xA9 1)"), "(0,1)");

    const CLayoutParseResult suffixed = ParseLayout("({0 < 12 >,1}<7>,2)<30>", kPanes);
    ASSERT_TRUE(suffixed.Ok());
    EXPECT_EQ(suffixed.root.sizeSuffix, 30);
    EXPECT_EQ(suffixed.root.children[0].sizeSuffix, 7);
    EXPECT_EQ(suffixed.root.children[0].children[0].sizeSuffix, 12);
    EXPECT_EQ(suffixed.root.children[0].children[1].sizeSuffix, -1);
    // A group that gives way to its members loses its own suffix; the members keep theirs.
    const CLayoutParseResult merged = ParseLayout("((0<5>,1)<9>,2)", kPanes);
    ASSERT_TRUE(merged.Ok());
    ASSERT_EQ(merged.root.children.size(), 3u);
    EXPECT_EQ(merged.root.children[0].sizeSuffix, 5);
    EXPECT_EQ(merged.root.children[1].sizeSuffix, -1);
}

TEST(LayoutParser, SurvivesDeepNesting) {
    const int depth = 200000;
    const std::string text = std::string(depth, '(') + "0" + std::string(depth, ')');
    EXPECT_EQ(Canonical(text), "(0)");
    EXPECT_EQ(ParseLayout(std::string(depth, '['), kPanes).error, kLayoutUnexpectedEnd);
}

TEST(LayoutParser, NumbersGroupsInPreOrder) {
    const CLayoutParseResult result = ParseLayout("({0,[1,2]},{3})", kPanes);
    ASSERT_TRUE(result.Ok());
    const auto groups = GroupsInPreOrder(result.root);
    ASSERT_EQ(groups.size(), 3u);  // {3} gave way to pane 3
    EXPECT_EQ(groups[0]->kind, kLayoutHorizontal);
    EXPECT_EQ(groups[1]->kind, kLayoutVertical);
    EXPECT_EQ(groups[2]->kind, kLayoutTabular);
    EXPECT_TRUE(GroupsInPreOrder(ParseLayout("(1)", kPanes).root).empty());
}

// Writes a random tree with the given panes, brackets and blanks chosen at random.
void RandomLayout(std::mt19937& random, std::vector<int>& panes, int depth, std::string& out) {
    static const char* const kOpen = "({[";
    static const char* const kClose = ")}]";
    const int kind = static_cast<int>(random() % 3);
    out += kOpen[kind];
    const int members = static_cast<int>(random() % 4);
    for (int i = 0; i < members; ++i) {
        if (depth < 4 && random() % 3 == 0) {
            RandomLayout(random, panes, depth + 1, out);
        } else if (!panes.empty()) {
            out += std::to_string(panes.back());
            panes.pop_back();
        }
        out += random() % 2 ? "," : " ";
    }
    out += kClose[kind];
}

TEST(LayoutParser, ComposedLayoutsParseBackToThemselves) {
    std::mt19937 random(7);
    for (int round = 0; round < 2000; ++round) {
        std::vector<int> panes = {0, 1, 2, 3, 4, 5};
        std::shuffle(panes.begin(), panes.end(), random);
        std::string text;
        RandomLayout(random, panes, 0, text);
        const CLayoutParseResult first = ParseLayout(text, 6);
        ASSERT_TRUE(first.Ok()) << text << ": " << first.message;
        const std::string composed = ComposeLayout(first.root);
        const CLayoutParseResult second = ParseLayout(composed, 6);
        ASSERT_TRUE(second.Ok()) << composed;
        EXPECT_EQ(ComposeLayout(second.root), composed) << text;
        // Normalised trees hold no group of one member and no member of its parent's kind.
        for (const CLayoutItem* group : GroupsInPreOrder(second.root)) {
            for (const CLayoutItem& child : group->children) {
                if (!child.IsPane()) {
                    EXPECT_NE(child.kind, group->kind) << composed;
                    EXPECT_GE(child.children.size(), 2u) << composed;
                }
            }
        }
        auto sorted = PanesOf(second.root);
        std::sort(sorted.begin(), sorted.end());
        EXPECT_TRUE(std::adjacent_find(sorted.begin(), sorted.end()) == sorted.end());
    }
}

TEST(LayoutParser, SplitsPredefinedLayouts) {
    const auto layouts = SplitPredefinedLayouts("Standard|({0,1},{2,3})|Tabs|[0,1,2,3]|Odd");
    ASSERT_EQ(layouts.size(), 2u);
    EXPECT_EQ(layouts[0].first, "Standard");
    EXPECT_EQ(layouts[0].second, "({0,1},{2,3})");
    EXPECT_EQ(layouts[1].first, "Tabs");
    EXPECT_EQ(layouts[1].second, "[0,1,2,3]");
    EXPECT_TRUE(SplitPredefinedLayouts("").empty());
    EXPECT_TRUE(SplitPredefinedLayouts("Standard").empty());
}

}  // namespace
