#pragma once
// One molecule as the search engine sees it: its name, its text and the text encoded against
// the matrix alphabet (one byte per residue, the 1-based alphabet position).

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

class CSimMol {
  public:
    CSimMol(std::string name, std::string sequence)
        : m_name(std::move(name)), m_sequence(std::move(sequence)) {}

    const std::string& Name() const { return m_name; }
    const std::string& Sequence() const { return m_sequence; }
    const std::vector<std::uint8_t>& Codes() const { return m_codes; }
    int Length() const { return static_cast<int>(m_sequence.size()); }
    void SetCodes(std::vector<std::uint8_t> codes) { m_codes = std::move(codes); }

  private:
    std::string m_name;
    std::string m_sequence;
    std::vector<std::uint8_t> m_codes;
};
