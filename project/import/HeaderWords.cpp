#include "import/HeaderWords.h"

#include <algorithm>

#include "import/ImportResult.h"
#include "import/Recognise.h"

int ApplyHeaderWords(CSxMol& molecule, const std::vector<std::string>& tokens) {
    for (std::size_t i = 2; i < tokens.size(); ++i) {
        int type = TypeOfHeaderWord(tokens[i]);
        if (type == kKindProtein && molecule.Kind() == kKindNucleic)
            return kProteinNotNucleic;
        if (type == kKindNucleic && molecule.Kind() == kKindProtein)
            return kNucleicNotProtein;
        if (IsCircularWord(tokens[i]))
            molecule.SetLinear(false);
    }
    return 0;
}

bool IsDatabaseDate(const std::string& token) {
    auto digits = [&](std::size_t from, std::size_t count) {
        return std::all_of(token.begin() + from, token.begin() + from + count,
                           [](char c) { return c >= '0' && c <= '9'; });
    };
    auto letters = [&](std::size_t from, std::size_t count) {
        return std::all_of(token.begin() + from, token.begin() + from + count,
                           [](char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z'); });
    };
    return token.size() == 11 && token[2] == '-' && token[6] == '-' && digits(0, 2) &&
           letters(3, 3) && digits(7, 4);
}
