#include "molecule/MolEntryOf.h"

CSxMolEntry MolEntryOf(const CSxMolX* molecule) {
    if (!molecule)
        return CSxMolEntry();
    return CSxMolEntry(molecule->Key(), molecule->Name(), molecule->Sequence());
}
