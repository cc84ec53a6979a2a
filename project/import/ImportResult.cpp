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

bool IsHardImportError(int result) {
    return result == kProteinNotNucleic || result == kNucleicNotProtein ||
           result == kIllegalCharacter;
}
