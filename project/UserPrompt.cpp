#include "UserPrompt.h"

void CRecordingPrompt::ShowMessage(const std::string& text, MessageIcon icon) {
    m_messages.push_back({text, icon});
}

int CRecordingPrompt::AskRawSequenceType(const std::string& path, int presetType) {
    m_rawQuestions.push_back(path);
    if (presetType != kTypeUnknown && m_rawSequenceAnswer != kTypeUnknown) return presetType;
    return m_rawSequenceAnswer;
}
