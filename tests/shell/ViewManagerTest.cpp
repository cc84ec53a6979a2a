#include <gtest/gtest.h>

#include <QApplication>
#include <QLayout>
#include <QSignalSpy>
#include <memory>

#include "QtPrinters.h"
#include "Settings.h"
#include "ViewManager.h"
#include "ViewTuneUpDlg.h"

namespace {

const QString kSection = QStringLiteral("ManagerTest");
const QString kDefault = QStringLiteral("({0,1},{2,3})");

void Settle() {
    for (int i = 0; i < 3; ++i) {
        QApplication::sendPostedEvents();
        QApplication::processEvents();
    }
}

// A host window with four named panes, as the main frame has.
struct Arrangement {
    explicit Arrangement(QSize size = {800, 600}) {
        host = std::make_unique<QWidget>();
        host->resize(size);
        manager = std::make_unique<CViewManager>(host.get(), settings);
        for (const char* title :
             {"Text pane", "Block List Pane", "Schematic Pane", "Alignment Pane"}) {
            auto* pane = new QWidget;
            pane->setWindowTitle(QString::fromLatin1(title));
            panes.push_back(pane);
            manager->AddPane(pane);
        }
        host->show();
    }

    bool Apply(const QString& layout) {
        QString error;
        const bool ok = manager->ApplyLayout(layout, error);
        Settle();
        return ok;
    }

    CSettings settings;
    std::unique_ptr<QWidget> host;
    std::unique_ptr<CViewManager> manager;
    std::vector<QWidget*> panes;
};

void ClearSettings() {
    QSettings settings(QSettings::IniFormat, QSettings::UserScope,
                       QString::fromLatin1(SettingsKeys::kOrganisation),
                       QString::fromLatin1(SettingsKeys::kApplication));
    settings.clear();
}

TEST(ViewManager, BuildsSplittersForTheDefaultLayout) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(kDefault));
    auto* top = qobject_cast<CMngrSplitter*>(arrangement.manager->TopWindow());
    ASSERT_NE(top, nullptr);
    EXPECT_EQ(top->orientation(), Qt::Horizontal);
    ASSERT_EQ(top->count(), 2);
    auto* left = qobject_cast<CMngrSplitter*>(top->widget(0));
    auto* right = qobject_cast<CMngrSplitter*>(top->widget(1));
    ASSERT_TRUE(left && right);
    EXPECT_EQ(left->orientation(), Qt::Vertical);
    EXPECT_EQ(left->widget(0), arrangement.panes[0]);
    EXPECT_EQ(left->widget(1), arrangement.panes[1]);
    EXPECT_EQ(right->widget(0), arrangement.panes[2]);
    EXPECT_EQ(right->widget(1), arrangement.panes[3]);
    for (QWidget* pane : arrangement.panes) {
        EXPECT_TRUE(pane->isVisible());
    }
    EXPECT_TRUE(top->windowTitle().startsWith(QStringLiteral("CMngrSplitter id=0x")));
}

TEST(ViewManager, BuildsTabsWithASplitterPage) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(QStringLiteral("[0,{(1,2),3}]")));
    auto* tabs = qobject_cast<CTabViewHolder*>(arrangement.manager->TopWindow());
    ASSERT_NE(tabs, nullptr);
    ASSERT_EQ(tabs->count(), 2);
    EXPECT_EQ(tabs->widget(0), arrangement.panes[0]);
    EXPECT_EQ(tabs->tabText(0), QStringLiteral("Text pane"));
    EXPECT_EQ(tabs->tabText(1), QStringLiteral("Sheet 2"));
    auto* stacked = qobject_cast<CMngrSplitter*>(tabs->widget(1));
    ASSERT_NE(stacked, nullptr);
    EXPECT_EQ(stacked->orientation(), Qt::Vertical);
    auto* row = qobject_cast<CMngrSplitter*>(stacked->widget(0));
    ASSERT_NE(row, nullptr);
    EXPECT_EQ(row->orientation(), Qt::Horizontal);
    EXPECT_EQ(row->widget(0), arrangement.panes[1]);
    EXPECT_EQ(row->widget(1), arrangement.panes[2]);
    EXPECT_EQ(stacked->widget(1), arrangement.panes[3]);
    EXPECT_EQ(arrangement.manager->GroupWindows().size(), 3);
}

TEST(ViewManager, FlattensNestedGroupsOfTheSameKind) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(QStringLiteral("(0,(1,2),3)")));
    auto* top = qobject_cast<CMngrSplitter*>(arrangement.manager->TopWindow());
    ASSERT_NE(top, nullptr);
    EXPECT_EQ(top->count(), 4);
    EXPECT_EQ(arrangement.manager->Compose(), QStringLiteral("(0,1,2,3)"));
}

TEST(ViewManager, KeepsTheArrangementWhenALayoutFails) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(kDefault));
    QWidget* top = arrangement.manager->TopWindow();
    QString error;
    EXPECT_FALSE(arrangement.manager->ApplyLayout(QStringLiteral("(0,0)"), error));
    EXPECT_EQ(error, QStringLiteral("Dublicate using view number"));
    EXPECT_EQ(arrangement.manager->TopWindow(), top);
    EXPECT_EQ(arrangement.manager->Compose(), kDefault);
}

TEST(ViewManager, ShowsALonePaneAndHidesTheOthers) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(QStringLiteral("(2)")));
    EXPECT_TRUE(arrangement.panes[2]->isVisible());
    EXPECT_FALSE(arrangement.panes[0]->isVisible());
    EXPECT_EQ(arrangement.manager->Compose(), QStringLiteral("(2)"));
}

TEST(ViewManager, SelectsTabsAndReportsTabChanges) {
    Arrangement arrangement;
    ASSERT_TRUE(arrangement.Apply(QStringLiteral("[0,{(1,2),3}]")));
    auto* tabs = qobject_cast<CTabViewHolder*>(arrangement.manager->TopWindow());
    QSignalSpy activations(arrangement.manager.get(), &CViewManager::paneActivationRequested);

    arrangement.manager->MakePaneVisible(arrangement.panes[3]);
    EXPECT_EQ(tabs->currentIndex(), 1);
    EXPECT_EQ(activations.count(), 0);  // the manager's own selection activates nothing
    arrangement.manager->MakePaneVisible(arrangement.panes[0]);
    EXPECT_EQ(tabs->currentIndex(), 0);

    tabs->setCurrentIndex(1);  // as a click on the tab does
    ASSERT_EQ(activations.count(), 1);
    EXPECT_EQ(activations[0][0].value<QWidget*>(), arrangement.panes[1]);
}

QList<int> SizesOf(QWidget* window) {
    return qobject_cast<QSplitter*>(window)->sizes();
}

TEST(ViewManager, StoresSizesPerLayoutAndScalesThemToTheWindow) {
    ClearSettings();
    {
        Arrangement arrangement({800, 600});
        QString error;
        ASSERT_TRUE(arrangement.manager->Create(kSection, kDefault, error));
        Settle();
        auto* top = qobject_cast<QSplitter*>(arrangement.manager->TopWindow());
        const int available = top->sizes()[0] + top->sizes()[1];
        top->setSizes({available / 4, available - available / 4});
        arrangement.manager->Save(kSection);
    }
    Arrangement bigger({1600, 600});
    QString error;
    ASSERT_TRUE(bigger.manager->Create(kSection, kDefault, error));
    Settle();
    const QList<int> sizes = SizesOf(bigger.manager->TopWindow());
    ASSERT_EQ(sizes.size(), 2);
    const double share = double(sizes[0]) / (sizes[0] + sizes[1]);
    EXPECT_NEAR(share, 0.25, 0.02);
}

TEST(ViewManager, RestoresTheLastLayoutAndFallsBackWhenItIsDamaged) {
    ClearSettings();
    {
        Arrangement arrangement;
        QString error;
        ASSERT_TRUE(arrangement.manager->Create(kSection, kDefault, error));
        ASSERT_TRUE(arrangement.Apply(QStringLiteral("[0,1,{2,3}]")));
        arrangement.manager->MakePaneVisible(arrangement.panes[2]);
        arrangement.manager->Save(kSection);
    }
    {
        Arrangement arrangement;
        QString error;
        ASSERT_TRUE(arrangement.manager->Create(kSection, kDefault, error));
        EXPECT_EQ(arrangement.manager->Compose(), QStringLiteral("[0,1,{2,3}]"));
        auto* tabs = qobject_cast<CTabViewHolder*>(arrangement.manager->TopWindow());
        ASSERT_NE(tabs, nullptr);
        EXPECT_EQ(tabs->currentIndex(), 2);  // the selected tab came back too
    }
    CSettings settings;
    settings.WriteProfileString(kSection, SettingsKeys::kLastLayout, QStringLiteral("(0,1"));
    Arrangement arrangement;
    QString error;
    ASSERT_TRUE(arrangement.manager->Create(kSection, kDefault, error));
    EXPECT_EQ(arrangement.manager->Compose(), kDefault);
}

TEST(ViewManager, MaximiseMoveRestoreKeepsTheOldSizes) {
    ClearSettings();
    Arrangement arrangement;
    QString error;
    ASSERT_TRUE(arrangement.manager->Create(kSection, kDefault, error));
    Settle();
    QWidget* left = arrangement.manager->GroupWindows()[1];
    const int available = SizesOf(left)[0] + SizesOf(left)[1];
    qobject_cast<QSplitter*>(left)->setSizes({available / 5, available - available / 5});
    Settle();
    const QList<int> before = SizesOf(left);

    ASSERT_TRUE(arrangement.manager->Maximize(QStringLiteral("[0,{(1,2),3}]"), error));
    Settle();
    EXPECT_TRUE(arrangement.manager->IsMaximized());
    EXPECT_NE(qobject_cast<CTabViewHolder*>(arrangement.manager->TopWindow()), nullptr);
    // Move a bar of the maximised arrangement.
    QWidget* stacked = arrangement.manager->GroupWindows()[1];
    qobject_cast<QSplitter*>(stacked)->setSizes({50, 400});
    Settle();

    ASSERT_TRUE(arrangement.manager->Restore(error));
    Settle();
    EXPECT_FALSE(arrangement.manager->IsMaximized());
    EXPECT_EQ(arrangement.manager->Compose(), kDefault);
    const QList<int> after = SizesOf(arrangement.manager->GroupWindows()[1]);
    ASSERT_EQ(after.size(), 2);
    EXPECT_NEAR(after[0], before[0], 2);
    EXPECT_NEAR(after[1], before[1], 2);

    // Saving while maximised stores the restored arrangement, never the maximised one.
    ASSERT_TRUE(arrangement.manager->Maximize(QStringLiteral("[3,{(0,1),2}]"), error));
    arrangement.manager->Save(kSection);
    EXPECT_FALSE(arrangement.manager->IsMaximized());
    CSettings settings;
    EXPECT_EQ(settings.GetProfileString(kSection, SettingsKeys::kLastLayout), kDefault);
    EXPECT_TRUE(settings
                    .GetProfileString(kSection + QStringLiteral("\\[3,{(0,1),2}]"),
                                      SettingsKeys::kMainString)
                    .isEmpty());
}

TEST(TuneUpDialog, EditsTheTreeAndFollowsThePredefinedLayouts) {
    const QStringList titles = {"Text pane", "Block List Pane", "Schematic Pane", "Alignment Pane"};
    const CLayoutItem current = ParseLayout("({0,1},{2,3})", 4).root;
    CViewTuneUpDlg dialog(current, titles, QStringLiteral("Standard|({0,1},{2,3})|Tabs|[0,1,2,3]"));
    QTreeWidget* tree = dialog.Tree();
    QTreeWidgetItem* root = tree->topLevelItem(0);
    ASSERT_NE(root, nullptr);
    EXPECT_EQ(root->text(0), QStringLiteral("Horizontal"));
    EXPECT_EQ(root->child(0)->text(0), QStringLiteral("Vertical"));
    EXPECT_EQ(root->child(0)->child(1)->text(0), QStringLiteral("Block List Pane"));
    EXPECT_EQ(dialog.Predefined()->currentText(), QStringLiteral("Standard"));

    EXPECT_FALSE(dialog.CanDismiss(root));
    EXPECT_FALSE(dialog.CanDismiss(root->child(0)->child(0)));  // a pane
    dialog.Dismiss(root->child(0));
    EXPECT_EQ(dialog.ComposeTree(), QStringLiteral("({2,3},0,1)"));
    EXPECT_EQ(dialog.Predefined()->currentText(), QStringLiteral("Custom"));

    dialog.Move(root->child(0), 2);  // not a neighbour: refused
    EXPECT_FALSE(dialog.CanMove(root, 1));
    dialog.Move(root->child(0), 1);
    EXPECT_EQ(dialog.ComposeTree(), QStringLiteral("(0,{2,3},1)"));

    dialog.ChangeKind(root, kLayoutTabular);
    dialog.ChangeKind(root->child(0), kLayoutVertical);  // a pane keeps being a pane
    EXPECT_EQ(dialog.ComposeTree(), QStringLiteral("[0,{2,3},1]"));
    dialog.AddSublayout(root->child(0), kLayoutHorizontal);  // a pane's group gets it
    EXPECT_EQ(dialog.ComposeTree(), QStringLiteral("[0,{2,3},1,()]"));

    dialog.Predefined()->setCurrentIndex(2);
    emit dialog.Predefined()->activated(2);
    EXPECT_EQ(dialog.ComposeTree(), QStringLiteral("[0,1,2,3]"));
    EXPECT_EQ(dialog.Predefined()->currentText(), QStringLiteral("Tabs"));
    dialog.accept();
    EXPECT_EQ(dialog.Result(), QStringLiteral("[0,1,2,3]"));
}

}  // namespace
