#pragma once
// The type words of a LOCUS or ID header line, checked against the molecule's kind.

#include <string>
#include <vector>

#include "molecule/SxMol.h"

// Looks at the header's words after the keyword and the name: a word naming the other molecule
// type gives kProteinNotNucleic or kNucleicNotProtein; "circular" clears the linear flag.
// 0 when nothing contradicts.
int ApplyHeaderWords(CSxMol& molecule, const std::vector<std::string>& tokens);

// A database date as the headers write it: "15-MAR-2017" (two digits, a month, four digits).
bool IsDatabaseDate(const std::string& token);
