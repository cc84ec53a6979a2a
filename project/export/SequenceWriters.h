#pragma once
// The sequence file writers of molecule export. Each appends one molecule to `out`.

#include <string>
#include <vector>

#include "molecule/SxMol.h"

// GenPept for a protein, GenBank for a nucleic acid.
void WriteGenBank(const CSxMol& molecule, std::string& out);
// SWISS-PROT for a protein, EMBL for a nucleic acid.
void WriteEmbl(const CSxMol& molecule, std::string& out);
// ">" and the name (blanks written as '\'), the sequence in lines of 70, an empty line; every
// line ends with CR LF. Upper case for proteins, lower case for nucleic acids.
void WriteFasta(const CSxMol& molecule, std::string& out);
// The whole sequence as one line ending with CR LF, cased as in FASTA.
void WriteRaw(const CSxMol& molecule, std::string& out);

// The choices of the export dialog, in its order.
enum ExportFilter { kExportFlatFile = 1, kExportSwissEmbl = 2, kExportFasta = 3, kExportRaw = 4 };
// Every molecule written by the writer of `filter`, in order; empty for other filters.
std::string ExportMolecules(const std::vector<const CSxMol*>& molecules, int filter);
