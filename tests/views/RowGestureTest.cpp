#include <QClipboard>
#include <QMenu>
#include <QMimeData>
#include <QScrollBar>
#include <QSignalSpy>
#include <map>

#include "AlnFixture.h"
#include "CommandIds.h"
#include "SelectionMirror.h"

namespace {

using Entries = std::vector<ALN_BSEL_ENTRY>;

TEST_F(AlnPaneTest, RowsShowTheLinkedLayout) {
    ASSERT_EQ(Ctrl().MiddleRowCount(), 3);
    EXPECT_EQ(Ctrl().RowAt(0)->Name(), "RulerWnd") << "the ruler is the top row";
    EXPECT_EQ(Ctrl().RowAt(Row("B"))->TextInColumns(0, 20), "mkvl--GGSTwq");
    EXPECT_EQ(Ctrl().RowAt(Row("C"))->TextInColumns(0, 20), "aamkvlGGSTwqrr");
    EXPECT_EQ(Ctrl().ColumnCount(), 14);
}

TEST_F(AlnPaneTest, BandSelectsTheColumnsOfEveryRowItMeets) {
    QSignalSpy cleared(&Ctrl(), &CTilxCtrl::selectionCleared);
    QSignalSpy completed(&m_pane, &CSegmentView::selectionCompleted);
    Drag(Cell("A", 1), Cell("C", 3));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 1, 4}, {"B", 1, 4}, {"C", 1, 4}}));
    EXPECT_EQ(cleared.count(), 1);
    EXPECT_EQ(completed.count(), 1);
    // Upwards and to the left gives the same rectangle.
    Drag(Cell("B", 3), Cell("A", 0));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 0, 4}, {"B", 0, 4}}));
}

TEST_F(AlnPaneTest, ColumnModeSelectsTheColumnsInEveryRow) {
    CTilxCtrl::Flags flags = Ctrl().GetFlags();
    flags.perRowSelection = false;
    Ctrl().SetFlags(flags);
    Drag(Cell("B", 9), Cell("B", 11));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 9, 12}, {"B", 9, 12}, {"C", 9, 12}}));
}

TEST_F(AlnPaneTest, CtrlAddsAndCoversExistingRanges) {
    Drag(Cell("A", 1), Cell("A", 2));
    Drag(Cell("A", 8), Cell("B", 9), Qt::ControlModifier);
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 1, 10}, {"B", 8, 10}}))
        << "A's range grows to cover both; B is new";
    Drag(Cell("C", 11), Cell("C", 12), Qt::ControlModifier);
    EXPECT_EQ(m_pane.SelectionEntries().size(), 3u) << "Ctrl keeps the other rows";
    Drag(Cell("C", 11), Cell("C", 12));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"C", 11, 13}})) << "without Ctrl: replaced";
}

TEST_F(AlnPaneTest, ShiftExtendsFromTheAnchor) {
    Drag(Cell("A", 2), Cell("A", 3));
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::ShiftModifier, Cell("A", 8));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 2, 9}}));
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::ShiftModifier, Cell("A", 0));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 0, 3}})) << "to the left of the anchor";
}

TEST_F(AlnPaneTest, DraggingAnEdgeMovesIt) {
    Drag(Cell("C", 2), Cell("C", 5));
    ASSERT_EQ(m_pane.SelectionEntries(), (Entries{{"C", 2, 6}}));
    const CColumnAxis axis = Ctrl().Axis();
    const QPoint endEdge(static_cast<int>(ColumnLeft(axis, 6)) + 1, RowY("C"));
    QTest::mouseMove(Viewport(), endEdge);
    EXPECT_EQ(Viewport()->cursor().shape(), Qt::SizeHorCursor);
    Drag(endEdge, QPoint(static_cast<int>(ColumnLeft(axis, 9)) + 2, RowY("C")));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"C", 2, 9}}));
    const QPoint startEdge(static_cast<int>(ColumnLeft(axis, 2)) - 2, RowY("C"));
    Drag(startEdge, QPoint(static_cast<int>(ColumnLeft(axis, 4)), RowY("C")));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"C", 4, 9}}));
    QTest::mouseMove(Viewport(), Cell("C", 6));
    EXPECT_NE(Viewport()->cursor().shape(), Qt::SizeHorCursor) << "inside the range";
}

TEST_F(AlnPaneTest, SelectionIsTrimmedAtGaps) {
    Drag(Cell("B", 2), Cell("B", 5));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"B", 2, 4}})) << "ends at the gap's start";
    Drag(Cell("B", 4), Cell("B", 7));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"B", 6, 8}})) << "starts after the gap";
    Drag(Cell("B", 4), Cell("B", 5));
    EXPECT_TRUE(m_pane.SelectionEntries().empty()) << "wholly inside the gap: cleared";
    Drag(Cell("A", 4), Cell("B", 5));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 4, 6}})) << "A has no gap there";
}

TEST_F(AlnPaneTest, HoldingTheMouseRightOfTheRowsScrolls) {
    m_pane.resize(Ctrl().SequenceArea().left() + 60, 160);
    QApplication::processEvents();
    ASSERT_TRUE(Ctrl().horizontalScrollBar()->maximum() > 0) << "the columns do not fit";
    ASSERT_EQ(Ctrl().FirstColumn(), 0);
    const QPoint outside(Ctrl().SequenceArea().right() + 5, RowY("C"));
    QTest::mousePress(Viewport(), Qt::LeftButton, Qt::NoModifier, Cell("A", 1));
    QTest::mouseMove(Viewport(), outside);
    EXPECT_TRUE(Ctrl().IsAutoScrolling());
    Ctrl().AutoScrollTick();
    Ctrl().AutoScrollTick();
    EXPECT_EQ(Ctrl().FirstColumn(), 2);
    QTest::mouseRelease(Viewport(), Qt::LeftButton, Qt::NoModifier, outside);
    EXPECT_FALSE(Ctrl().IsAutoScrolling());
    const int last = ColumnAtX(Ctrl().Axis(), Ctrl().SequenceArea().right());
    EXPECT_EQ(m_pane.SelectionEntries(),
              (Entries{{"A", 1, last + 1}, {"B", 1, last + 1}, {"C", 1, last + 1}}))
        << "to the column under the area's right edge";
    // Inside the area the timer stops.
    QTest::mousePress(Viewport(), Qt::LeftButton, Qt::NoModifier, Cell("A", 4));
    QTest::mouseMove(Viewport(), outside);
    QTest::mouseMove(Viewport(), Cell("A", 5));
    EXPECT_FALSE(Ctrl().IsAutoScrolling());
    QTest::mouseRelease(Viewport(), Qt::LeftButton, Qt::NoModifier, Cell("A", 5));
}

TEST_F(AlnPaneTest, NamesSelectRowsAndMoveThem) {
    QSignalSpy selected(&Ctrl(), &CTilxCtrl::rowSelectedChanged);
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::NoModifier, Name("A"));
    EXPECT_TRUE(Ctrl().RowAt(Row("A"))->IsSelected());
    EXPECT_EQ(Ctrl().CurrentRow(), Row("A"));
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::ControlModifier, Name("C"));
    EXPECT_TRUE(Ctrl().RowAt(Row("A"))->IsSelected());
    EXPECT_TRUE(Ctrl().RowAt(Row("C"))->IsSelected());
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::ControlModifier, Name("C"));
    EXPECT_FALSE(Ctrl().RowAt(Row("C"))->IsSelected()) << "Ctrl toggles";
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::NoModifier, Name("A"));
    EXPECT_FALSE(Ctrl().RowAt(Row("C"))->IsSelected());
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::ShiftModifier, Name("C"));
    EXPECT_TRUE(Ctrl().RowAt(Row("B"))->IsSelected()) << "Shift selects the rows between";
    EXPECT_TRUE(Ctrl().RowAt(Row("C"))->IsSelected());
    EXPECT_GE(selected.count(), 4);

    QSignalSpy moved(&Ctrl(), &CTilxCtrl::rowMoved);
    const int a = Row("A");
    Drag(Name("A"), Name("C"));
    ASSERT_EQ(moved.count(), 1);
    EXPECT_EQ(Row("B"), a);
    EXPECT_EQ(Row("A"), a + 2) << "dropped on the last row: A goes last";
}

TEST_F(AlnPaneTest, KeysMoveTheCurrentRowAndScroll) {
    Ctrl().setFocus();
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::NoModifier, Name("A"));
    QTest::keyClick(Viewport(), Qt::Key_Down);
    EXPECT_EQ(Ctrl().CurrentRow(), Row("B"));
    QTest::keyClick(Viewport(), Qt::Key_Down);
    QTest::keyClick(Viewport(), Qt::Key_Down);
    EXPECT_EQ(Ctrl().CurrentRow(), Row("C")) << "stays on the last row";
    QTest::keyClick(Viewport(), Qt::Key_Up);
    EXPECT_EQ(Ctrl().CurrentRow(), Row("B"));
    QTest::keyClick(Viewport(), Qt::Key_Right);
    EXPECT_EQ(Ctrl().FirstColumn(), 0) << "no scroll bar, no scrolling";
}

TEST_F(AlnPaneTest, DoubleClickIsReported) {
    QSignalSpy doubled(&Ctrl(), &CTilxCtrl::rowDoubleClicked);
    QTest::mouseDClick(Viewport(), Qt::LeftButton, Qt::NoModifier, Cell("B", 7));
    ASSERT_EQ(doubled.count(), 1);
    EXPECT_EQ(doubled.at(0).at(0).toInt(), Row("B"));
}

TEST_F(AlnPaneTest, CopyPutsTheCurrentRowsSelectionOnTheClipboard) {
    CCommandState state;
    ASSERT_TRUE(m_pane.UpdateCommand(ID_EDIT_COPY, state));
    EXPECT_FALSE(state.enabled);
    Drag(Cell("C", 3), Cell("B", 8));
    ASSERT_TRUE(m_pane.UpdateCommand(ID_EDIT_COPY, state));
    EXPECT_TRUE(state.enabled);
    m_pane.RunCommand(ID_EDIT_COPY);
    EXPECT_EQ(QApplication::clipboard()->mimeData()->text(), "kvlGGS") << "row C, pressed first";
}

TEST_F(AlnPaneTest, ShowingABlockSelectsItsColumnsAndScrollsOnlyWhenHidden) {
    const CSimBlock& linked = *m_project.BlockSet().BlockAt(0);
    m_pane.ShowBlockSelected(linked, false, true);
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"A", 6, 10}, {"B", 6, 10}, {"C", 6, 10}}));
    EXPECT_EQ(Ctrl().FirstColumn(), 0) << "visible: no scrolling";
    m_pane.resize(Ctrl().SequenceArea().left() + 40, 160);
    QApplication::processEvents();
    ASSERT_LT(Ctrl().VisibleColumnCount(), 6);
    m_pane.ShowBlockSelected(linked, false, true);
    EXPECT_EQ(Ctrl().FirstColumn(), ClampFirstColumn(1, 14, Ctrl().VisibleColumnCount()));
}

TEST_F(AlnPaneTest, ReceivedResiduesBecomeColumnsAndGoBackAsResidues) {
    // Residues 2..5 of B stand at columns 2, 3, 6 and 7: the gap lies inside the range.
    ASSERT_TRUE(m_pane.ShowReceivedSelection({"B", 2, 6}));
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"B", 2, 8}}));
    EXPECT_EQ(Ctrl().CurrentRow(), Row("B"));
    const std::optional<CResidueSelection> sent = m_pane.SelectionForBroadcast();
    ASSERT_TRUE(sent.has_value());
    EXPECT_EQ(sent->molecule, "B");
    EXPECT_EQ(sent->first, 2);
    EXPECT_EQ(sent->last, 6);
    EXPECT_FALSE(m_pane.ShowReceivedSelection({"missing", 1, 3}));
    EXPECT_FALSE(m_pane.ShowReceivedSelection({"A", 4, 4})) << "an empty range";
}

class CRecordingMirror : public ISelectionMirror {
  public:
    void MirrorSelectionCompleted(const Entries& entries, bool scroll) override {
        completed.push_back(entries);
        scrolled = scroll;
    }
    void MirrorSelectionCleared() override { ++cleared; }
    void MirrorRowRange(const std::string& row, int start, int end) override {
        ranges.push_back({row, start, end});
    }
    void MirrorRowMoved(const std::string& row, int index) override {
        moved.emplace_back(row, index);
    }
    void MirrorCurrentRow(const std::string& row) override { current.push_back(row); }

    std::vector<Entries> completed;
    bool scrolled = true;
    int cleared = 0;
    Entries ranges;
    std::vector<std::pair<std::string, int>> moved;
    std::vector<std::string> current;
};

TEST_F(AlnPaneTest, SelectionsAreMirroredOneWay) {
    CRecordingMirror mirror;
    m_pane.SetMirror(&mirror);
    Drag(Cell("A", 2), Cell("B", 5));
    ASSERT_EQ(mirror.completed.size(), 1u);
    EXPECT_EQ(mirror.completed[0], m_pane.SelectionEntries()) << "the trimmed entries";
    EXPECT_FALSE(mirror.scrolled);
    EXPECT_EQ(mirror.cleared, 1);
    QTest::mouseClick(Viewport(), Qt::LeftButton, Qt::NoModifier, Name("C"));
    EXPECT_EQ(mirror.current, std::vector<std::string>{"C"});

    // What the other pane sends is taken over and not sent back.
    const Entries theirs = {{"C", 9, 12}, {"missing", 1, 2}};
    m_pane.MirrorSelectionCompleted(theirs, true);
    EXPECT_EQ(m_pane.SelectionEntries(), (Entries{{"C", 9, 12}}));
    m_pane.MirrorSelectionCleared();
    m_pane.MirrorRowMoved("A", 2);
    EXPECT_EQ(Row("A"), Ctrl().FirstMiddleIndex() + 2);
    EXPECT_EQ(mirror.completed.size(), 1u);
    EXPECT_EQ(mirror.cleared, 1);
    EXPECT_TRUE(mirror.moved.empty());
    m_pane.SetMirror(nullptr);
}

TEST_F(AlnPaneTest, ContextMenuFollowsTheCommandOrder) {
    std::map<int, QAction*> actions;
    QObject owner;
    for (int id : CBlockAlnView::ContextMenuCommands()) {
        if (id != 0)
            actions[id] = new QAction(QString::number(id), &owner);
    }
    m_pane.SetActionLookup(
        [&actions](int id) { return actions.count(id) ? actions[id] : nullptr; });
    std::unique_ptr<QMenu> menu(m_pane.CreateContextMenu(nullptr));
    QStringList items;
    for (QAction* action : menu->actions())
        items << (action->isSeparator() ? QStringLiteral("-") : action->text());
    const QStringList expected = {"32784", "-",     "32786", "32787", "-",    "32843",
                                  "-",     "32824", "-",     "57609", "30417"};
    EXPECT_EQ(items, expected);
    m_pane.SetActionLookup(nullptr);
}

}  // namespace
