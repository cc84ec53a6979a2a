#include "molecule/BlockListEntry.h"

void CBlockListEntry::Serialize(CArchive& ar) {
    ar.XMember(m_first);
    ar.XMember(m_second);
}

TB_REGISTER_CLASS(CBlockListEntry);
