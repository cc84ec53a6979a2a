#include "molecule/SxMolX.h"

#include "molecule/MolKeys.h"

CSxMolX::CSxMolX() : m_key(NewMoleculeKey()) {}

CSxMolX::CSxMolX(int kind) : CSxMol(kind), m_key(NewMoleculeKey()) {}

CSxMolX::CSxMolX(const CSxMol& source) : CSxMol(source), m_key(NewMoleculeKey()) {}

CSxMolX::CSxMolX(const CSxMolX& source) : CSxMol(source), m_key(NewMoleculeKey()) {}

void CSxMolX::Serialize(CArchive& ar) {
    // The molecule part as its own record; the qualified call keeps it from dispatching back
    // here.
    struct CMolPart {
        CSxMol& molecule;
        void Serialize(CArchive& archive) { molecule.CSxMol::Serialize(archive); }
    } part{*this};
    ar.XData(part);
    if (ar.IsStoring()) {
        ar.XMember(m_key);
    } else if (!ar.AtEnd()) {
        ar.XMember(m_key);
        NoteLoadedMoleculeKey(m_key);
    }
}

TB_REGISTER_CLASS(CSxMolX);
