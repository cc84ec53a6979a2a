#pragma once
// The built-in substitution tables, packed as lower triangles (row i holds columns 0..i) over
// the protein order "ABCDEFGHIKLMNPQRSTVWXYZ" (276 values) or the nucleotide order
// "ABCDGHKMNRSTUVWXY" (153 values).

#include <cstdint>
#include <span>
#include <string_view>

struct CBuiltinMatrix {
    std::string_view name;
    std::int32_t type;  // kProteinType or kNucleotideType
    std::span<const std::int16_t> triangle;
};

// Every built-in table, in the order the program lists them.
std::span<const CBuiltinMatrix> BuiltinMatrices();
// The built-in table `name` (case-sensitive), or null.
const CBuiltinMatrix* FindBuiltinMatrix(std::string_view name);
