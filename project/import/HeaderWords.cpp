#include "import/HeaderWords.h"

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
