#include <gtest/gtest.h>

#include "links/LinkHistory.h"

namespace {

CLinkList LinksWith(int count) {
    CLinkList links;
    for (int i = 0; i < count; ++i) {
        auto link = std::make_unique<CLink>(i * 10);
        link->AddMolecule(0, i * 10, 3, 0);
        link->AddMolecule(1, i * 10, 3, 0);
        links.Add(std::move(link));
    }
    return links;
}

TEST(LinkHistory, OneSnapshotAllowsNeitherUndoNorRedo) {
    CLinkHistory history;
    CLinkList links;
    EXPECT_FALSE(history.Undo(links));
    history.Push(links);
    EXPECT_FALSE(history.CanUndo());
    EXPECT_FALSE(history.CanRedo());
    EXPECT_FALSE(history.Undo(links));
    EXPECT_FALSE(history.Redo(links));
    EXPECT_EQ(history.Position(), 0);
}

TEST(LinkHistory, UndoAndRedoWalkTheSnapshots) {
    CLinkHistory history;
    CLinkList links;
    for (int i = 0; i <= 3; ++i)
        history.Push(LinksWith(i));
    EXPECT_FALSE(history.CanRedo());
    ASSERT_TRUE(history.Undo(links));
    EXPECT_EQ(links, LinksWith(2));
    ASSERT_TRUE(history.Undo(links));
    EXPECT_EQ(links, LinksWith(1));
    ASSERT_TRUE(history.Redo(links));
    EXPECT_EQ(links, LinksWith(2));
    ASSERT_TRUE(history.Redo(links));
    EXPECT_EQ(links, LinksWith(3));
    EXPECT_FALSE(history.Redo(links));
    EXPECT_EQ(links, LinksWith(3));
}

TEST(LinkHistory, PushAfterTwoUndosDropsTheUndoneSnapshots) {
    CLinkHistory history;
    CLinkList links;
    for (int i = 0; i <= 3; ++i)
        history.Push(LinksWith(i));
    history.Undo(links);
    history.Undo(links);
    history.Push(LinksWith(5));
    EXPECT_EQ(history.Count(), 3);
    EXPECT_FALSE(history.CanRedo());
    ASSERT_TRUE(history.Undo(links));
    EXPECT_EQ(links, LinksWith(1));
}

TEST(LinkHistory, CopiesAreIndependent) {
    CLinkHistory history;
    for (int i = 0; i <= 2; ++i)
        history.Push(LinksWith(i));
    CLinkList links;
    history.Undo(links);
    CLinkHistory copy(history);
    EXPECT_EQ(copy.Position(), 1);
    copy.Push(LinksWith(4));
    EXPECT_EQ(history.Count(), 3);
    EXPECT_TRUE(history.CanRedo());
    EXPECT_EQ(history.Snapshot(2), LinksWith(2));
    history.Clear();
    EXPECT_EQ(history.Position(), -1);
    EXPECT_FALSE(history.CanUndo());
    EXPECT_EQ(copy.Count(), 3);
}

}  // namespace
