#pragma once
// Result codes of the sequence readers and the texts the import shows for them.

#include <string>

enum ImportResult {
    kReadOne = 100,          // one molecule read; more may follow
    kNoName = 1,             // the record has no name
    kProteinNotNucleic = 2,  // protein record where nucleic acid was expected
    kNucleicNotProtein = 3,  // nucleic-acid record where protein was expected
    kNoSequence = 4,         // the record has no sequence
    kNoMoreRecords = 5,      // normal end of the file
    kFormatNotSupported = 6,
    kBadSuiteData = 7,      // the record's embedded molecule data could not be read
    kIllegalCharacter = 8,  // a character outside the alphabet
};

// Thrown (as CMolListException) when the file cannot be read at all.
constexpr int kImportUnreadable = 9;

// The message for a result; `fileName` is the file name without its folder, `line` the line
// number for kIllegalCharacter.
std::string ImportResultMessage(int result, const std::string& fileName, int line);
// Whether the import shows that message: only for the results that end it with an error.
bool IsHardImportError(int result);
