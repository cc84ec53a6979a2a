#include "GuiPrompt.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

#include "TcxMsgBox.h"

namespace {
CGuiPrompt::RawHook& RawHookSlot() {
    static CGuiPrompt::RawHook hook;
    return hook;
}
}  // namespace

CImportRawDlg::CImportRawDlg(const QString& path, int presetType, QWidget* parent)
    : QDialog(parent),
      m_dna(new QRadioButton(QStringLiteral("DNA/RNA sequence"), this)),
      m_protein(new QRadioButton(QStringLiteral("protein sequence "), this)),
      m_import(new QPushButton(QStringLiteral("Import"), this)) {
    setWindowTitle(QStringLiteral("Import"));
    auto* text = new QLabel(QStringLiteral("Unrecognized file format: ") + path, this);
    text->setWordWrap(true);
    auto* question =
        new QLabel(QStringLiteral("Would you like to import this file as raw sequence?"), this);
    auto* buttons = new QDialogButtonBox(this);
    buttons->addButton(m_import, QDialogButtonBox::AcceptRole);
    buttons->addButton(QStringLiteral("Cancel"), QDialogButtonBox::RejectRole);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(text);
    layout->addWidget(question);
    layout->addWidget(m_dna);
    layout->addWidget(m_protein);
    layout->addWidget(buttons);

    if (presetType != kTypeUnknown) {
        (presetType == kTypeNucleic ? m_dna : m_protein)->setChecked(true);
        m_dna->setEnabled(false);
        m_protein->setEnabled(false);
    }
    auto updateImport = [this] {
        m_import->setEnabled(m_dna->isChecked() || m_protein->isChecked());
    };
    connect(m_dna, &QRadioButton::toggled, this, updateImport);
    connect(m_protein, &QRadioButton::toggled, this, updateImport);
    updateImport();
}

int CImportRawDlg::Choice() const {
    return m_dna->isChecked() ? kTypeNucleic : m_protein->isChecked() ? kTypeProtein : kTypeUnknown;
}

void CGuiPrompt::SetRawHook(RawHook hook) {
    RawHookSlot() = std::move(hook);
}

unsigned CGuiPrompt::BoxTypeFor(MessageIcon icon) {
    switch (icon) {
        case MessageIcon::information:
            return MB_OK | MB_ICONASTERISK;
        case MessageIcon::exclamation:
            return MB_OK | MB_ICONEXCLAMATION;
        case MessageIcon::error:
            return MB_OK | MB_ICONHAND;
        case MessageIcon::question:
            return MB_OK | MB_ICONQUESTION;
        default:
            return MB_OK;
    }
}

void CGuiPrompt::ShowMessage(const std::string& text, MessageIcon icon) {
    CTcxMsgBox::Show(m_parent, QString::fromStdString(text), BoxTypeFor(icon));
}

int CGuiPrompt::AskRawSequenceType(const std::string& path, int presetType) {
    if (RawHookSlot()) {
        return RawHookSlot()(path, presetType);
    }
    CImportRawDlg dialog(QString::fromStdString(path), presetType, m_parent);
    return dialog.exec() == QDialog::Accepted ? dialog.Choice() : kTypeUnknown;
}
