#pragma once
// The record stamps (creator and modifier) travel through flat files as comment lines that
// begin with a marker and carry the stamps' archive bytes in hexadecimal.

#include <string>
#include <string_view>
#include <vector>

#include "molecule/SxMol.h"

inline constexpr std::string_view kSuiteDataMarker = "@QRBO-DATA@";

// The comment lines (without the flat file's line prefix) that carry the molecule's stamps.
std::vector<std::string> SuiteDataLines(const CSxMol& molecule);
// Whether a comment line carries embedded data; its hex text is appended to `hex`.
bool TakeSuiteDataLine(std::string_view commentLine, std::string& hex);
// Reads the stamps from the collected hex text into the molecule; false when it is damaged.
bool ReadSuiteData(const std::string& hex, CSxMol& molecule);
