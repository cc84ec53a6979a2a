#pragma once
// The sequence readers. Each reads one molecule from the stream into `molecule` (whose kind
// must be set: it decides the alphabet and which type words contradict) and returns an
// ImportResult code. They start by clearing the molecule, except for its kind.

#include "import/SxStream.h"
#include "molecule/SxMol.h"

int ReadFasta(CSxMol& molecule, CSxStream& stream);
int ReadRaw(CSxMol& molecule, CSxStream& stream);
int ReadGenBank(CSxMol& molecule, CSxStream& stream);
int ReadEmbl(CSxMol& molecule, CSxStream& stream);
int ReadSuiteText(CSxMol& molecule, CSxStream& stream);

// The reader for a format code (SequenceFormat); kFormatNotSupported for others.
int ReadMolecule(int format, CSxMol& molecule, CSxStream& stream);
