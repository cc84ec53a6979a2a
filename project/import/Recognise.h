#pragma once
// Recognition of a sequence file's format and molecule type from its lines.

#include <string>
#include <string_view>
#include <vector>

#include "UserPrompt.h"  // MoleculeType
#include "import/SxStream.h"

// Format codes.
enum SequenceFormat {
    kFormatUnknown = 0,
    kFormatGenBank = 1,  // GenBank / GenPept flat file
    kFormatEmbl = 2,     // EMBL / SWISS-PROT flat file
    kFormatFasta = 3,
    kFormatRaw = 4,    // never recognised; chosen by the user
    kFormatSuite = 6,  // the suite's own molecule text format
};

struct CRecognition {
    int type = 0;  // MoleculeType
    int format = kFormatUnknown;
    bool suiteFormat = false;
};

// Reads lines from the stream's position until the format is known; leaves the stream
// wherever it stopped.
CRecognition Recognise(CSxStream& stream);

// The content test: reads lines until the end or a line containing one of `stopMarkers` and
// decides nucleic (1) or protein (2) from the residue tokens; 0 when nothing decided. A
// protein token wins over any number of nucleotide tokens.
int TypeByContent(CSxStream& stream, const std::vector<std::string>& stopMarkers);

// The molecule type a word of a LOCUS or ID header names ("aa", "prt" -> 2; "bp", "circular",
// words containing "DNA" or "RNA" -> 1), or 0. A trailing ';', '.' or ',' is ignored.
int TypeOfHeaderWord(std::string_view word);
// Whether a header word says the molecule is circular.
bool IsCircularWord(std::string_view word);
