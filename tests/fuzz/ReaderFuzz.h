#pragma once
// What every sequence reader must do with any bytes, checked by the fuzz target of each
// format: read the file record by record as the import does, end every record with a result
// code, move on by at least one line per record (so the import always ends), skip damaged
// records with a message, and give molecules without blanks or digits in their sequences whose
// plain names and sequences come back unchanged through the export writers.

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "export/SequenceWriters.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"

namespace fuzz {

inline void Check(bool condition) {
    if (!condition)
        std::abort();
}

inline bool IsPlain(const CSxMol& molecule) {
    const std::string& name = molecule.Name();
    const std::string& sequence = molecule.Sequence();
    return !name.empty() && std::all_of(name.begin(), name.end(), [](unsigned char c) {
        return std::isalnum(c) || c == '_';
    }) && std::all_of(sequence.begin(), sequence.end(), [](unsigned char c) {
        return c >= 'a' && c <= 'z';
    });
}

// Sequences hold residues only: the readers leave out blanks, line ends and position numbers.
inline bool HoldsResiduesOnly(const std::string& sequence) {
    return std::none_of(sequence.begin(), sequence.end(), [](unsigned char c) {
        return std::isdigit(c) || c == ' ' || c == '\t' || c == '\r' || c == '\n';
    });
}

inline int FormatOfWriter(int filter) {
    switch (filter) {
        case kExportFlatFile:
            return kFormatGenBank;
        case kExportSwissEmbl:
            return kFormatEmbl;
        default:
            return kFormatFasta;
    }
}

inline void CheckWritersReadBack(const CSxMol& molecule) {
    for (int filter : {kExportFlatFile, kExportSwissEmbl, kExportFasta}) {
        CSxStream stream(ExportMolecules({&molecule}, filter));
        CSxMol read(molecule.Kind());
        Check(ReadMolecule(FormatOfWriter(filter), read, stream) == kReadOne);
        Check(read.Name() == molecule.Name());
        Check(read.Sequence() == molecule.Sequence());
    }
}

// Reads every record of `text` with the reader of `format` as a molecule of `kind`.
inline void ReadEveryRecord(int format, int kind, const std::string& text) {
    CSxStream stream(text);
    CSkippedRecords skipped("fuzz");
    int read = 0;
    for (;;) {
        const int before = stream.LineNumber();
        CSxMol molecule(kind);
        const int result = ReadMolecule(format, molecule, stream);
        Check(result == kReadOne || (result >= kNoName && result <= kIllegalCharacter));
        if (IsEndOfRecords(result))
            break;
        Check(stream.LineNumber() > before);
        Check(stream.RecordLine() > before && stream.RecordLine() <= stream.LineNumber());
        Check(stream.ProblemLine() >= stream.RecordLine());
        if (result != kReadOne) {
            skipped.Add(result, stream.RecordLine(), stream.ProblemLine());
            continue;
        }
        ++read;
        Check(!molecule.Sequence().empty() && HoldsResiduesOnly(molecule.Sequence()));
        Check(molecule.SequenceLength() == static_cast<int>(molecule.Sequence().size()));
        if (IsPlain(molecule))
            CheckWritersReadBack(molecule);
    }
    // Something is always said about a file that gave nothing, and about skipped records.
    Check(skipped.Message(read).empty() == (read > 0 && skipped.Empty()));
}

// The fuzz body of one reader: recognition, then the reader for both molecule kinds.
inline int FuzzReader(int format, const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    CSxStream stream(text);
    const CRecognition recognition = Recognise(stream);
    Check(recognition.type >= kTypeUnknown && recognition.type <= kTypeProtein);
    for (int kind : {kKindNucleic, kKindProtein})
        ReadEveryRecord(format, kind, text);
    return 0;
}

}  // namespace fuzz
