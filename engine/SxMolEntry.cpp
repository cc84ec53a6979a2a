#include "SxMolEntry.h"

void CSxMolEntry::Serialize(CArchive& ar) {
    ar.XMember(m_key);
    ar.XMember(m_name);
    ar.XMember(m_sequence);
}

TB_REGISTER_CLASS(CSxMolEntry);
