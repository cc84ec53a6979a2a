#pragma once
// The main window: menu bar, toolbars, status bar and the four panes, which the layout manager
// arranges. It follows the active pane (its toolbar and View menu), maximises and restores
// panes, opens dropped files and pastes sequences from the clipboard.

#include <QMainWindow>
#include <QPointer>
#include <array>

#include "CommandTarget.h"
#include "PaneView.h"
#include "SelectionBroadcast.h"

class CCommandRouter;
class CQuilterApp;
class CQuilterDoc;
class CSettings;
class CViewManager;
class QToolBar;

class CMainFrame : public QMainWindow, public ICommandTarget {
    Q_OBJECT
  public:
    static constexpr char kLayoutSection[] = "QuilterMainWnd";
    static constexpr char kDefaultLayout[] = "({0,1},{2,3})";
    static constexpr char kPredefinedLayouts[] = "Standard|({0,1},{2,3})";

    CMainFrame(CQuilterApp& app, CQuilterDoc& document, CSettings& settings,
               CCommandRouter& router);
    ~CMainFrame() override;

    // Creates the bars and the panes and arranges them; false with `error` on failure.
    bool Create(QString& error);

    CPaneView* Pane(int number) const;
    CPaneView* ActivePane() const { return m_activePane; }
    void ActivatePane(int number);
    CViewManager& ViewManager() const { return *m_viewManager; }
    QToolBar* ToolBar(const QString& name) const;
    QMenu* ViewMenu() const { return m_viewMenu; }
    bool ToolbarsVisible() const { return m_toolbarsVisible; }

    // Adds sequence files, or opens the first block project among them.
    void DropFiles(const QStringList& paths);
    void Paste();
    // Shows a selection that a sibling program broadcast.
    void ReceiveBroadcast(const CBroadcastRecord& record);
    CSelectionBroadcast& Broadcast() { return m_broadcast; }

    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;

  protected:
    void closeEvent(QCloseEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dropEvent(QDropEvent* event) override;

  private:
    void CreateMenus();
    void CreateToolBars();
    QToolBar* MakeToolBar(const QString& name, std::initializer_list<int> ids);
    void CreatePanes();
    void SetActivePane(CPaneView* pane);
    void ShowPaneToolBar();
    void RebuildViewMenu();
    void ToggleMaximized();
    void ToggleToolBars();
    void SendBroadcast();
    QToolBar* PaneToolBarOf(int paneNumber) const;

    CQuilterApp& m_app;
    CQuilterDoc& m_document;
    CSettings& m_settings;
    CCommandRouter& m_router;
    CViewManager* m_viewManager = nullptr;
    std::array<CPaneView*, kPaneCount> m_panes{};
    QPointer<CPaneView> m_activePane;
    QMenu* m_viewMenu = nullptr;
    QToolBar* m_mainBar = nullptr;
    QToolBar* m_paneBar = nullptr;
    std::array<QToolBar*, kPaneCount> m_paneBars{};
    bool m_toolbarsVisible = true;
    CSelectionBroadcast m_broadcast;
};
