#pragma once
// The key, name and sequence of a molecule as it took part in a search. Block sets keep one per
// molecule of the search, so blocks can be shown and exported without pointers into the
// project's molecule list.

#include <string>

#include "archive/Archive.h"

class CSxMolEntry : public CSerializable {
public:
    TB_CLASS_TAG("SxMolEntry")
    CSxMolEntry() = default;
    CSxMolEntry(std::string key, std::string name, std::string sequence)
        : m_key(std::move(key)), m_name(std::move(name)), m_sequence(std::move(sequence)) {}

    const std::string& Key() const { return m_key; }
    const std::string& Name() const { return m_name; }
    const std::string& Sequence() const { return m_sequence; }

    void Serialize(CArchive& ar) override;

    bool operator==(const CSxMolEntry& other) const {
        return m_key == other.m_key && m_name == other.m_name && m_sequence == other.m_sequence;
    }

private:
    std::string m_key;
    std::string m_name;
    std::string m_sequence;
};
