#pragma once
// "About Tiler Blocks": version, comments and build date.

#include <QDialog>

class CAboutDlg : public QDialog {
    Q_OBJECT
  public:
    explicit CAboutDlg(QWidget* parent = nullptr);

    static QString Version();
    static QString Comments();
    static QString BuildDate();
};
