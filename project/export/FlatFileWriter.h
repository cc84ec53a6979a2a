#pragma once
// Line output shared by the GenBank and EMBL writers: a keyword column followed by text that
// is filled to the line width and continued under the text column.

#include <string>
#include <vector>

#include "molecule/SxMol.h"

class CFlatFileWriter {
  public:
    // `textColumn`: where text starts (12 for GenBank, 5 for EMBL).
    CFlatFileWriter(std::string& out, std::size_t textColumn) : m_out(out), m_column(textColumn) {}

    // Appends one line, without trailing blanks.
    void Line(const std::string& text);
    // `first` (padded to the text column) before the first line, `next` before the others.
    void Lines(const std::string& first, const std::string& next,
               const std::vector<std::string>& lines);
    // `text` filled at blanks under `keyword`; `continuation` heads the following lines (the
    // keyword again in EMBL, blanks in GenBank). Nothing for empty text unless `always`.
    void Filled(const std::string& keyword, const std::string& continuation,
                const std::string& text, bool always = false);
    // The feature table; `prefix` is what stands before the key column ("     " or "FT   ").
    void Features(const std::string& prefix, const std::vector<CSxFeature>& features);

    std::string Padded(const std::string& keyword) const;

  private:
    std::string& m_out;
    std::size_t m_column;
};

// The lines of the sequence in blocks of ten, sixty residues a line.
std::vector<std::string> SequenceBlocks(const std::string& sequence);
