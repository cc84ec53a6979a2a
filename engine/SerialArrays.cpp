#include "SerialArrays.h"

void CBoolSerialArray::Serialize(CArchive& ar) {
    std::size_t count = size();
    ar.XCount(count, 2);
    if (ar.IsLoading()) assign(count, 0);
    for (auto& value : *this) {
        bool flag = value != 0;
        ar.XMember(flag);
        value = flag ? 1 : 0;
    }
}

TB_REGISTER_CLASS(CIntSerialArray);
TB_REGISTER_CLASS(CClrfSerialArray);
TB_REGISTER_CLASS(CBoolSerialArray);
