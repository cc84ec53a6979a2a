#pragma once
// How the project library tells the user something or asks a question without showing anything
// itself: the caller passes an IUserPrompt. The GUI answers with dialogs, the command-line tool
// on stderr and from its options, tests with CRecordingPrompt. Texts are made here, so tests see
// the exact words.

#include <string>
#include <vector>

enum class MessageIcon { none, information, exclamation, error, question };

// Molecule types as the molecule list counts them.
enum MoleculeType { kTypeUnknown = 0, kTypeNucleic = 1, kTypeProtein = 2 };

class IUserPrompt {
public:
    virtual ~IUserPrompt() = default;
    // A message with an OK button only.
    virtual void ShowMessage(const std::string& text, MessageIcon icon) = 0;
    // The import's raw-sequence question for a file it did not recognise: the answer is the
    // type to read it as (kTypeNucleic or kTypeProtein), or kTypeUnknown to cancel. When
    // `presetType` is known the user can only confirm it or cancel.
    virtual int AskRawSequenceType(const std::string& path, int presetType) = 0;
};

// Records every message and answers questions from preset values; for tests and for callers
// that must not interact.
class CRecordingPrompt : public IUserPrompt {
public:
    struct Message {
        std::string text;
        MessageIcon icon;
    };

    explicit CRecordingPrompt(int rawSequenceAnswer = kTypeUnknown)
        : m_rawSequenceAnswer(rawSequenceAnswer) {}

    void ShowMessage(const std::string& text, MessageIcon icon) override;
    int AskRawSequenceType(const std::string& path, int presetType) override;

    const std::vector<Message>& Messages() const { return m_messages; }
    // Paths the raw-sequence question was asked for, in order.
    const std::vector<std::string>& RawQuestions() const { return m_rawQuestions; }
    void SetRawSequenceAnswer(int answer) { m_rawSequenceAnswer = answer; }

private:
    int m_rawSequenceAnswer;
    std::vector<Message> m_messages;
    std::vector<std::string> m_rawQuestions;
};
