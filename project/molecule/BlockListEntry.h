#pragma once
// A pair of strings the block list keeps per row.

#include <string>

#include "archive/Archive.h"

class CBlockListEntry : public CSerializable {
  public:
    TB_CLASS_TAG("BlockListEntry")
    CBlockListEntry() = default;
    CBlockListEntry(std::string first, std::string second)
        : m_first(std::move(first)), m_second(std::move(second)) {}

    const std::string& First() const { return m_first; }
    const std::string& Second() const { return m_second; }

    void Serialize(CArchive& ar) override;

  private:
    std::string m_first;
    std::string m_second;
};
