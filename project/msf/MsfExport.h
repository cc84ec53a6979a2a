#pragma once
// The linked alignment as a multiple-sequence file headed "PileUp": a header with the total
// checksum, one descriptor line per sequence, then interleaved blocks of 50 columns in groups
// of 10.

#include <string>
#include <string_view>
#include <vector>

class CAlignmentLayout;

struct MSF_ENTRY {
    std::string name;      // the row's displayed name
    std::string sequence;  // the row's aligned text, gaps included
    int index = 0;         // position in the record
    int check = 0;         // GCG checksum, set when writing
};

class CMsfExport {
  public:
    static constexpr int kDefaultBlockWidth = 50;

    // Deletes the entries and restores the defaults.
    void Reset();
    // Fills the record from the alignment: one entry per molecule entry 0 .. entryCount - 1 that
    // has a row, in entry order; the length is the alignment's column count.
    void Build(const CAlignmentLayout& layout, int entryCount);
    // Valid, a length, protein type and at least one entry.
    bool IsWritable() const;
    // Normalises the entries (upper case, padded with '.', '.' for gaps, '_' for blanks in
    // names), computes the checksums and returns the file's text.
    std::string Write();
    // Writes the text to `path`, replacing it atomically. Throws CFileException.
    void Save(const std::string& path);

    bool IsValid() const { return m_valid; }
    int Length() const { return m_length; }
    char SequenceType() const { return m_sequenceType; }
    int TotalCheck() const { return m_totalCheck; }
    const std::vector<MSF_ENTRY>& Entries() const { return m_entries; }
    // For records assembled by hand.
    void SetAlignment(int length, std::vector<MSF_ENTRY> entries);

  private:
    void Normalise();
    void ComputeChecks();
    std::string Layout() const;

    bool m_valid = false;
    int m_length = 0;
    char m_sequenceType = 'P';
    int m_totalCheck = 0;
    std::vector<MSF_ENTRY> m_entries;
    int m_blockWidth = kDefaultBlockWidth;
};

// The GCG checksum of a sequence: the sum of ((i mod 57) + 1) x character code, a '-' counting
// as '.', modulo 10000.
int GcgChecksum(std::string_view sequence);

// The message for an MSF file that cannot be written.
std::string MsfWriteErrorMessage(const std::string& path);
