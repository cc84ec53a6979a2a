#pragma once
// Karlin-Altschul constants per number of sequences, carried by a score matrix and used to
// judge the significance of blocks.

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "TextTokens.h"
#include "archive/Archive.h"

// lambda and K for blocks of `sequences` sequences.
class CStatConst : public CSerializable {
  public:
    TB_CLASS_TAG("StatConst")
    CStatConst() = default;
    CStatConst(std::int32_t sequences, double lambda, double k, bool marked)
        : sequences(sequences), lambda(lambda), k(k), marked(marked ? 1 : 0) {}
    void Serialize(CArchive& ar) override;

    std::int32_t sequences = 0;
    double lambda = 0.0;
    double k = 0.0;
    std::int32_t marked = 0;  // non-zero when the source line carried a "*"; only written back
};

// An owned list of constants that stores itself as a count followed by tagged pointers.
class CStatSerialArray : public CSerializable, public std::vector<std::unique_ptr<CStatConst>> {
  public:
    TB_CLASS_TAG("StatArray")
    void Serialize(CArchive& ar) override;
};

class CStatTable : public CSerializable {
  public:
    TB_CLASS_TAG("StatTable")
    static constexpr const char* kDefaultReference =
        "Statistical constants computed according to Karlin & Altschul (1990).  "
        "Proc.Natl.Acad.Sci.USA  87, 2264-2268.";

    CStatTable() = default;
    CStatTable(const CStatTable& other);
    CStatTable& operator=(const CStatTable& other);
    CStatTable(CStatTable&&) noexcept = default;
    CStatTable& operator=(CStatTable&&) noexcept = default;

    // The constants of the first entry for `sequences`; false (outputs untouched) when none.
    bool Lookup(std::int32_t sequences, double& lambda, double& k) const;
    // Replaces the entry for `sequences`, or appends one when there is none.
    void Set(std::int32_t sequences, double lambda, double k, bool marked);
    // Deletes every entry; the reference text stays.
    void Clear();
    bool IsEmpty() const { return m_constants.empty(); }
    std::size_t Count() const { return m_constants.size(); }
    // The entries in the order they were added.
    const CStatSerialArray& Entries() const { return m_constants; }

    // The note on where the constants come from, written into matrix files.
    const std::string& Reference() const { return m_reference; }
    void SetReference(std::string reference) { m_reference = std::move(reference); }

    // Appends the statistics section of a matrix text file to `out` (nothing when empty).
    void AppendText(std::string& out) const;
    // One statistics line, split at blanks, commas and tabs: the number of sequences (a whole
    // number, at least 1), lambda and K (numbers, not negative), then a token containing "*"
    // when the entry is marked; further tokens are ignored. Empty when `entry` was read, else
    // why the line is not a statistics line.
    static std::string ParseTextLine(std::string_view line, CStatConst& entry);
    // Replaces the entries by those of the statistics lines, in order; a later line for the
    // same number of sequences replaces the earlier one in place. Takes time linear in the
    // number of lines. On a malformed line the table stays as it was and `error` names the
    // line and why.
    bool ReadTextLines(const std::vector<CTextLine>& lines, std::string& error);

    void Serialize(CArchive& ar) override;

  private:
    CStatSerialArray m_constants;
    std::string m_reference = kDefaultReference;
};
