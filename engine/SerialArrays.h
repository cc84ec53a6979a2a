#pragma once
// Arrays of 32-bit integers, booleans and colour values that store themselves as a count
// followed by the elements.

#include <cstdint>
#include <vector>

#include "archive/Archive.h"

template <class T, const char* Tag>
class CSerialArray : public CSerializable, public std::vector<T> {
public:
    using std::vector<T>::vector;
    static constexpr const char* kClassTag = Tag;
    const char* ClassTag() const override { return Tag; }
    void Serialize(CArchive& ar) override {
        std::size_t count = this->size();
        ar.XCount(count, 2);
        if (ar.IsLoading()) this->assign(count, T{});
        for (std::size_t i = 0; i < count; ++i) SerializeElement(ar, (*this)[i]);
    }

private:
    static void SerializeElement(CArchive& ar, T& value) { ar.XMember(value); }
};

inline constexpr char kIntArrayTag[] = "IntArray";
inline constexpr char kClrfArrayTag[] = "ClrfArray";

using CIntSerialArray = CSerialArray<std::int32_t, kIntArrayTag>;
// Colour values: 32-bit, red in the low byte; 0x01000000 means "no colour".
using CClrfSerialArray = CSerialArray<std::uint32_t, kClrfArrayTag>;

// Booleans kept as 32-bit values, since std::vector<bool> hands out proxies.
class CBoolSerialArray : public CSerializable, public std::vector<std::int32_t> {
public:
    TB_CLASS_TAG("BoolArray")
    using std::vector<std::int32_t>::vector;
    void Serialize(CArchive& ar) override;
};

inline constexpr std::uint32_t kNoColour = 0x01000000;
