#pragma once
// How the core's messages and questions reach the user in the program: message boxes, and the
// "Import" dialog for files that are imported as raw sequence.

#include <QDialog>
#include <QRadioButton>
#include <functional>

#include "UserPrompt.h"

class QWidget;

// "Import": asks whether a file of unknown format is DNA/RNA or protein raw sequence.
class CImportRawDlg : public QDialog {
    Q_OBJECT
  public:
    // `presetType` kTypeUnknown lets the user choose; otherwise only that type is offered.
    CImportRawDlg(const QString& path, int presetType, QWidget* parent = nullptr);
    // kTypeNucleic or kTypeProtein.
    int Choice() const;

    QRadioButton* DnaChoice() const { return m_dna; }
    QRadioButton* ProteinChoice() const { return m_protein; }
    QPushButton* ImportButton() const { return m_import; }

  private:
    QRadioButton* m_dna;
    QRadioButton* m_protein;
    QPushButton* m_import;
};

class CGuiPrompt : public IUserPrompt {
  public:
    // Answers the raw-sequence question instead of the dialog (tests).
    using RawHook = std::function<int(const std::string& path, int presetType)>;

    explicit CGuiPrompt(QWidget* parent = nullptr) : m_parent(parent) {}
    void ShowMessage(const std::string& text, MessageIcon icon) override;
    int AskRawSequenceType(const std::string& path, int presetType) override;

    static void SetRawHook(RawHook hook);
    static unsigned BoxTypeFor(MessageIcon icon);

  private:
    QWidget* m_parent;
};
