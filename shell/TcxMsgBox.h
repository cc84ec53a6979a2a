#pragma once
// Every message of the program goes through this box: fixed button texts ("Ok"; "Yes", "No";
// "Yes", "No", "Cancel"), an icon chosen from the type, and a hook through which tests answer.

#include <QMessageBox>
#include <QString>
#include <QStringList>
#include <functional>

// Box types and icons, combined with |.
enum MessageBoxType : unsigned {
    MB_OK = 0x0,
    MB_YESNOCANCEL = 0x3,
    MB_YESNO = 0x4,
    MB_TYPEMASK = 0xF,
    MB_ICONHAND = 0x10,
    MB_ICONQUESTION = 0x20,
    MB_ICONEXCLAMATION = 0x30,
    MB_ICONASTERISK = 0x40,
    MB_ICONMASK = 0xF0,
};

// Answers.
enum MessageBoxResult : int { IDOK = 1, IDCANCEL = 2, IDYES = 6, IDNO = 7 };

class CTcxMsgBox {
  public:
    // Receives every message instead of a dialog and returns the answer.
    using Hook = std::function<int(const QString& text, unsigned type)>;

    static int Show(QWidget* parent, const QString& text, unsigned type = MB_OK);
    static void SetTestHook(Hook hook);

    static QMessageBox::Icon IconFor(unsigned type);
    static QStringList ButtonTextsFor(unsigned type);
};
