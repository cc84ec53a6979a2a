#pragma once
// The block set's light copy of a project molecule.

#include "SxMolEntry.h"
#include "molecule/SxMolX.h"

// Key, name and sequence of `molecule`; three empty strings for a null molecule.
CSxMolEntry MolEntryOf(const CSxMolX* molecule);
