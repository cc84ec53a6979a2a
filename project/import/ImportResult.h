#pragma once
// Result codes of the sequence readers and the texts the import shows for them.

#include <string>
#include <vector>

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
// Whether a reader's result ends the records of a file (every other result but kReadOne is a
// record the import skips).
bool IsEndOfRecords(int result);

// The message for a record the import skipped: the reader's message for `result`, naming the
// file (and for kIllegalCharacter the line `problemLine`), and the line the record starts on.
std::string SkippedRecordMessage(int result, const std::string& fileName, int recordLine,
                                 int problemLine);
// The records of one file that the import skipped, told to the user in one message.
class CSkippedRecords {
  public:
    // At most this many records are listed one by one; the rest are counted.
    static constexpr std::size_t kListed = 10;

    explicit CSkippedRecords(std::string fileName) : m_fileName(std::move(fileName)) {}
    void Add(int result, int recordLine, int problemLine);
    bool Empty() const { return m_count == 0; }
    // What the user is told once the file is read: one line per listed record, then how many
    // more were skipped; when no molecule was read and nothing was skipped, that the file
    // holds no sequence. Empty when there is nothing to tell.
    std::string Message(int moleculesRead) const;

  private:
    std::string m_fileName;
    std::vector<std::string> m_listed;
    std::size_t m_count = 0;
};
