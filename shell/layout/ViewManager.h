#pragma once
// Arranges the panes of the main window after a layout string: builds splitters and tab
// holders from the parsed tree, moves the existing panes into them, keeps sizes and selected
// tabs in the settings per layout string, maximises one pane and restores the arrangement.

#include <QObject>
#include <QSplitter>
#include <QTabWidget>
#include <QVector>

#include "LayoutParser.h"

class CSettings;

class CMngrSplitter : public QSplitter {
    Q_OBJECT
  public:
    CMngrSplitter(Qt::Orientation orientation, int controlId, QWidget* parent = nullptr);
};

class CTabViewHolder : public QTabWidget {
    Q_OBJECT
  public:
    explicit CTabViewHolder(QWidget* parent = nullptr);
};

class CViewManager : public QObject {
    Q_OBJECT
  public:
    // `host` is the widget whose whole area the arrangement fills.
    CViewManager(QWidget* host, CSettings& settings, QObject* parent = nullptr);
    ~CViewManager() override;

    // Panes are registered in pane-number order before anything is built.
    void AddPane(QWidget* pane);
    int PaneCount() const { return static_cast<int>(m_panes.size()); }
    QWidget* PaneByNumber(int number) const;

    // Applies the last layout stored in `section`, or `defaultLayout` when there is none or it
    // no longer parses.
    bool Create(const QString& section, const QString& defaultLayout, QString& error);
    // Applies the layout stored in `section` ("MainString", default `defaultLayout`) with the
    // sizes stored beside it.
    bool ApplyStoredLayout(const QString& section, const QString& defaultLayout, QString& error);
    // Parses and builds a layout with equal shares; the current arrangement stays on failure.
    bool ApplyLayout(const QString& layout, QString& error);
    QString Compose() const;
    // Writes the arrangement: "LastLayout" in `section`, the sizes in its subsection.
    void Save(const QString& section);

    bool Maximize(const QString& layout, QString& error);
    bool Restore(QString& error);
    bool IsMaximized() const { return m_maximized; }

    // Shows the dialog that edits the arrangement; an accepted layout is applied from its
    // subsection of `section`. Returns false only when applying failed (`error` says why).
    bool TuneUp(const QString& section, const QString& predefinedLayouts, QString& error);

    // Selects the tab that holds the pane in every enclosing tab holder.
    void MakePaneVisible(QWidget* pane);

    const CLayoutItem& Root() const { return m_root; }
    QWidget* TopWindow() const { return m_top; }
    // The splitter or tab holder built for each group, in the storage numbering.
    QVector<QWidget*> GroupWindows() const;

  signals:
    // The user chose another tab; `pane` is the first pane on it.
    void paneActivationRequested(QWidget* pane);

  private:
    QWidget* Build(const CLayoutItem& item, int controlId);
    void DetachPanes();
    void SaveSizes(const QString& section);
    void LoadSizes(const QString& section);
    static QString Subsection(const QString& section, const QString& layout);
    QWidget* FirstPaneOf(QWidget* page) const;
    void OnTabChanged(CTabViewHolder* holder, int index);

    QWidget* m_host;
    CSettings& m_settings;
    QVector<QWidget*> m_panes;
    CLayoutItem m_root;
    QWidget* m_top = nullptr;
    QVector<QWidget*> m_groupWindows;  // pre-order, parallel to GroupsInPreOrder(m_root)
    QString m_restoreLayout;
    bool m_maximized = false;
    int m_silent = 0;  // tab changes made by the manager itself activate nothing
};
