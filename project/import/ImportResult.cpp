#include "import/ImportResult.h"

std::string ImportResultMessage(int result, const std::string& fileName, int line) {
    switch (result) {
        case kNoName:
            return "File " + fileName + ": No molecule name found";
        case kProteinNotNucleic:
            return "File " + fileName +
                   ": Protein file is indicated while DNA/RNA molecule file is expected";
        case kNucleicNotProtein:
            return "File " + fileName +
                   ": DNA/RNA molecule file is indicated while protein file is expected";
        case kNoSequence:
            return "File " + fileName + ": No sequence data found";
        case kFormatNotSupported:
            return "Format Not Supported";
        case kBadSuiteData:
            return "Failed to read serialized QRBO data";
        case kIllegalCharacter:
            return "Sequence File " + fileName + ": Contains Illegal Character(s) in Line " +
                   std::to_string(line);
        default:
            return "No error detected!";
    }
}

bool IsEndOfRecords(int result) {
    return result == kNoMoreRecords || result == kFormatNotSupported;
}

std::string SkippedRecordMessage(int result, const std::string& fileName, int recordLine,
                                 int problemLine) {
    std::string reason = ImportResultMessage(result, fileName, problemLine);
    // The suite-data message does not name the file by itself.
    if (result == kBadSuiteData)
        reason = "File " + fileName + ": " + reason;
    return reason + " (the record at line " + std::to_string(recordLine) + " was skipped)";
}

void CSkippedRecords::Add(int result, int recordLine, int problemLine) {
    if (++m_count <= kListed)
        m_listed.push_back(SkippedRecordMessage(result, m_fileName, recordLine, problemLine));
}

std::string CSkippedRecords::Message(int moleculesRead) const {
    if (m_count == 0)
        return moleculesRead > 0 ? std::string() : ImportResultMessage(kNoSequence, m_fileName, 0);
    std::string text;
    for (const std::string& line : m_listed) {
        if (!text.empty())
            text += '\n';
        text += line;
    }
    if (const std::size_t more = m_count - m_listed.size()) {
        text += "\n... and " + std::to_string(more) + " more " +
                (more == 1 ? "record of " + m_fileName + " was"
                           : "records of " + m_fileName + " were") +
                " skipped";
    }
    return text;
}
