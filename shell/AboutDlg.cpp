#include "AboutDlg.h"

#include <QDialogButtonBox>
#include <QHBoxLayout>
#include <QIcon>
#include <QLabel>
#include <QVBoxLayout>

CAboutDlg::CAboutDlg(QWidget* parent) : QDialog(parent) {
    setWindowTitle(QStringLiteral("About Tiler Blocks"));
    auto* icon = new QLabel(this);
    icon->setPixmap(QIcon(QStringLiteral(":/icons/tiler-blocks.svg")).pixmap(64, 64));
    auto* text = new QLabel(QStringLiteral("<b>Tiler Blocks</b> version %1<br>%2<br><br>Built %3")
                                .arg(Version(), Comments(), BuildDate()),
                            this);
    text->setObjectName(QStringLiteral("AboutText"));
    text->setWordWrap(true);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok, this);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    auto* row = new QHBoxLayout;
    row->addWidget(icon, 0, Qt::AlignTop);
    row->addWidget(text, 1);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(row);
    layout->addWidget(buttons);
    setMinimumWidth(380);
}

QString CAboutDlg::Version() {
    return QStringLiteral(TB_VERSION);
}

QString CAboutDlg::Comments() {
    return QStringLiteral(
        "Finds conserved ungapped blocks in sets of protein sequences, and lets you edit and "
        "link them into an alignment.");
}

QString CAboutDlg::BuildDate() {
    return QStringLiteral(TB_BUILD_DATE);
}
