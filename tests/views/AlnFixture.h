#pragma once
// A small linked project shown in an alignment pane, and the points of its cells.
//
//   A  mkvlaaGGSTwq      residues 6..9 of A, 4..7 of B and 6..9 of C are linked at column 6,
//   B  mkvl--GGSTwq      so B has a gap at columns 4 and 5; one block holds the linked
//   C  aamkvlGGSTwqrr    residues, a second one A's and C's residues 1..3.

#include <gtest/gtest.h>

#include <QApplication>
#include <QTest>

#include "AlignmentPane.h"
#include "project/ProjectFixtures.h"

inline void PrintTo(const ALN_BSEL_ENTRY& entry, std::ostream* out) {
    *out << entry.name << ":" << entry.start << "-" << entry.end;
}

class CTestDocument : public IPaneDocument {
  public:
    explicit CTestDocument(CBlockProject* project) : m_project(project) {}
    CBlockProject* Project() const override { return m_project; }
    void SetModifiedFlag(bool) override {}

  private:
    CBlockProject* m_project;
};

class AlnPaneTest : public ::testing::Test {
  protected:
    AlnPaneTest() : m_dir("aln_pane"), m_document(&m_project) {}

    void SetUp() override {
        m_project = ProjectWith(m_dir, ">A\nmkvlaaggstwq\n>B\nmkvlggstwq\n>C\naamkvlggstwqrr\n");
        m_project.Params().SetPalette({0x00C08040, 0x0040C0FF});
        InstallBlocks(m_project, {{{0, 1, 2}, {6, 4, 6}, 4, 90}, {{0, 2}, {1, 1}, 3, 50}});
        CRecordingPrompt prompt;
        const std::vector<ALN_BSEL_ENTRY> columns = {{"A", 6, 10}, {"B", 4, 8}, {"C", 6, 10}};
        ASSERT_TRUE(m_project.Link(columns, prompt));
        m_pane.SetDocument(&m_document);
        m_pane.resize(520, 160);
        m_pane.show();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(&m_pane));
        m_pane.OnUpdate(nullptr, kHintAll);
    }

    CTilxCtrl& Ctrl() { return *m_pane.Ctrl(); }
    QWidget* Viewport() { return Ctrl().viewport(); }
    int Row(const char* name) { return Ctrl().IndexOfRow(QString::fromLatin1(name)); }
    int RowY(const char* name) {
        const std::optional<QRect> rect = Ctrl().RowRect(Row(name));
        EXPECT_TRUE(rect.has_value()) << name << " is not shown";
        return rect ? rect->center().y() : -1;
    }
    // The middle of a cell, found through the control's column axis.
    QPoint Cell(const char* name, int column) {
        const CColumnAxis axis = Ctrl().Axis();
        return {static_cast<int>(ColumnLeft(axis, column) + axis.scale / 2), RowY(name)};
    }
    QPoint Name(const char* name) { return {Ctrl().NameArea().center().x(), RowY(name)}; }

    void Drag(QPoint from, QPoint to, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        QTest::mousePress(Viewport(), Qt::LeftButton, modifiers, from);
        QTest::mouseMove(Viewport(), to);
        QTest::mouseRelease(Viewport(), Qt::LeftButton, modifiers, to);
    }

    CScratchDir m_dir;
    CBlockProject m_project;
    CTestDocument m_document;
    CBlockAlnView m_pane;
};
