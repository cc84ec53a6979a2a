#pragma once
// "PaneManager editor": edits the arrangement of the panes as a tree of groups, offers the
// predefined layouts and previews the result.

#include <QComboBox>
#include <QDialog>
#include <QStringList>
#include <QTreeWidget>
#include <optional>
#include <utility>
#include <vector>

#include "LayoutParser.h"

// Draws a parsed layout: splitter groups in equal parts, tab groups as a frame with tab shapes
// along the bottom showing their first member, panes as labelled boxes.
class CViewPreview : public QWidget {
    Q_OBJECT
  public:
    CViewPreview(const QStringList& paneTitles, QWidget* parent = nullptr);
    void SetLayout(std::optional<CLayoutItem> root);
    QSize sizeHint() const override { return {260, 200}; }

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    void Draw(QPainter& painter, const CLayoutItem& item, QRect rect) const;

    QStringList m_paneTitles;
    std::optional<CLayoutItem> m_root;
};

class CViewTuneUpDlg : public QDialog {
    Q_OBJECT
  public:
    CViewTuneUpDlg(const CLayoutItem& current, const QStringList& paneTitles,
                   const QString& predefinedLayouts, QWidget* parent = nullptr);

    // The layout composed from the tree when the dialog was accepted.
    QString Result() const { return m_result; }
    // The layout the tree describes now.
    QString ComposeTree() const;

    QTreeWidget* Tree() const { return m_tree; }
    QComboBox* Predefined() const { return m_predefined; }
    CViewPreview* Preview() const { return m_preview; }

    // The editing operations of the tree's context menu.
    void ChangeKind(QTreeWidgetItem* item, int kind);
    void Dismiss(QTreeWidgetItem* item);
    void AddSublayout(QTreeWidgetItem* item, int kind);
    void Move(QTreeWidgetItem* item, int offset);
    bool CanDismiss(QTreeWidgetItem* item) const;
    bool CanMove(QTreeWidgetItem* item, int offset) const;

    void accept() override;

  private:
    void FillTree(const CLayoutItem& root);
    QTreeWidgetItem* MakeItem(const CLayoutItem& item) const;
    void SetItemKind(QTreeWidgetItem* item, int kind) const;
    static int KindOf(const QTreeWidgetItem* item);
    void OnTreeChanged();
    void OnPredefinedChosen(int index);
    void ShowContextMenu(const QPoint& position);

    QStringList m_paneTitles;
    std::vector<std::pair<QString, QString>> m_layouts;  // "Custom" first, then the predefined
    QTreeWidget* m_tree;
    CViewPreview* m_preview;
    QComboBox* m_predefined;
    QString m_result;
};
