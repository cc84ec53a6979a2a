#pragma once
// A molecule of a project: the molecule record plus a key that the block set uses to refer to
// it. Keys are upper-case hexadecimal text, made once per object and kept across save and load.

#include <string>

#include "molecule/SxMol.h"

class CSxMolX : public CSxMol {
  public:
    TB_CLASS_TAG("SxMolX")
    // Every constructor, the copies included, gives the object a key of its own.
    CSxMolX();
    explicit CSxMolX(int kind);
    explicit CSxMolX(const CSxMol& source);
    CSxMolX(const CSxMolX& source);
    CSxMolX& operator=(const CSxMolX&) = delete;

    const std::string& Key() const { return m_key; }

    // The molecule record as one embedded record, then the key. A record that ends after the
    // molecule part loads and keeps the key made at construction.
    void Serialize(CArchive& ar) override;

  private:
    std::string m_key;
};
