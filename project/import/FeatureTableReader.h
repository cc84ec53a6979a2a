#pragma once
// Reads the feature table of GenBank and EMBL/SWISS-PROT entries: a feature key in column 6,
// its location and qualifiers ("/name=value") from column 22, both continued over lines. The
// older SWISS-PROT layout ("KEY  from  to  description") is read as well.

#include <string>
#include <string_view>
#include <vector>

#include "molecule/SxMol.h"

class CFeatureTableReader {
  public:
    // One line of the table with any line code already blanked out.
    void AddLine(std::string_view line);
    // The features read, in order.
    std::vector<CSxFeature> Finish();

  private:
    void StartFeature(std::string_view key, std::string_view rest);
    void CloseQualifier();
    bool QualifierOpen() const;
    void AppendOldStyleNote(std::string_view text);

    std::vector<CSxFeature> m_features;
    std::string m_location;   // location text of the current feature, joined
    std::string m_qualifier;  // raw text of the current qualifier, joined
    bool m_inQualifier = false;
    bool m_oldStyleNote = false;  // a description of the older layout, kept as a note
};
