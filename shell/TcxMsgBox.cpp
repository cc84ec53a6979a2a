#include "TcxMsgBox.h"

#include <QApplication>
#include <QPushButton>
#include <utility>

namespace {

CTcxMsgBox::Hook& TestHook() {
    static CTcxMsgBox::Hook hook;
    return hook;
}

struct ButtonSpec {
    const char* text;
    int result;
    QMessageBox::ButtonRole role;
};

std::vector<ButtonSpec> ButtonsFor(unsigned type) {
    switch (type & MB_TYPEMASK) {
        case MB_YESNO:
            return {{"Yes", IDYES, QMessageBox::YesRole}, {"No", IDNO, QMessageBox::NoRole}};
        case MB_YESNOCANCEL:
            return {{"Yes", IDYES, QMessageBox::YesRole},
                    {"No", IDNO, QMessageBox::NoRole},
                    {"Cancel", IDCANCEL, QMessageBox::RejectRole}};
        default:
            return {{"Ok", IDOK, QMessageBox::AcceptRole}};
    }
}

}  // namespace

void CTcxMsgBox::SetTestHook(Hook hook) {
    TestHook() = std::move(hook);
}

QMessageBox::Icon CTcxMsgBox::IconFor(unsigned type) {
    switch (type & MB_ICONMASK) {
        case MB_ICONASTERISK:
            return QMessageBox::Information;
        case MB_ICONQUESTION:
            return QMessageBox::Question;
        case MB_ICONEXCLAMATION:
            return QMessageBox::Warning;
        case MB_ICONHAND:
            return QMessageBox::Critical;
        default:
            // The one-button box shows the program's icon, the others a warning.
            return (type & MB_TYPEMASK) == MB_OK ? QMessageBox::NoIcon : QMessageBox::Warning;
    }
}

QStringList CTcxMsgBox::ButtonTextsFor(unsigned type) {
    QStringList texts;
    for (const ButtonSpec& button : ButtonsFor(type)) {
        texts << QString::fromLatin1(button.text);
    }
    return texts;
}

int CTcxMsgBox::Show(QWidget* parent, const QString& text, unsigned type) {
    if (TestHook()) {
        return TestHook()(text, type);
    }
    QMessageBox box(parent ? parent : QApplication::activeWindow());
    box.setWindowTitle(QStringLiteral("Tiler Blocks"));
    box.setText(text);
    const QMessageBox::Icon icon = IconFor(type);
    if (icon == QMessageBox::NoIcon) {
        box.setIconPixmap(QApplication::windowIcon().pixmap(48, 48));
    } else {
        box.setIcon(icon);
    }
    const std::vector<ButtonSpec> specs = ButtonsFor(type);
    std::vector<std::pair<QPushButton*, int>> buttons;
    for (const ButtonSpec& button : specs) {
        buttons.emplace_back(box.addButton(QString::fromLatin1(button.text), button.role),
                             button.result);
    }
    box.setDefaultButton(buttons.front().first);
    box.setEscapeButton(buttons.back().first);
    box.exec();
    for (const auto& [button, result] : buttons) {
        if (box.clickedButton() == button) {
            return result;
        }
    }
    return specs.size() == 1 ? IDOK : IDCANCEL;
}
