// Sequence file import: recognition and every reader on arbitrary bytes must end with a result
// code, without crashing or looping. Molecules with plain names and sequences must come back
// unchanged through the flat-file writers.

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "export/SequenceWriters.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"

namespace {

void Check(bool condition) {
    if (!condition)
        std::abort();
}

bool IsPlain(const CSxMol& molecule) {
    const std::string& name = molecule.Name();
    const std::string& sequence = molecule.Sequence();
    return !name.empty() && std::all_of(name.begin(), name.end(), [](unsigned char c) {
        return std::isalnum(c) || c == '_';
    }) && std::all_of(sequence.begin(), sequence.end(), [](unsigned char c) {
        return c >= 'a' && c <= 'z';
    });
}

void CheckWritersReadBack(const CSxMol& molecule) {
    for (int filter : {kExportFlatFile, kExportSwissEmbl, kExportFasta}) {
        std::string text = ExportMolecules({&molecule}, filter);
        CSxStream stream(text);
        int format = filter == kExportFlatFile    ? kFormatGenBank
                     : filter == kExportSwissEmbl ? kFormatEmbl
                                                  : kFormatFasta;
        CSxMol read(molecule.Kind());
        Check(ReadMolecule(format, read, stream) == kReadOne);
        Check(read.Name() == molecule.Name());
        Check(read.Sequence() == molecule.Sequence());
    }
}

void ReadEveryRecord(int format, int kind, const std::string& data, std::size_t lineCount) {
    CSxStream stream(data);
    for (std::size_t calls = 0;; ++calls) {
        // Every record read takes at least one line.
        Check(calls <= lineCount + 1);
        CSxMol molecule(kind);
        int result = ReadMolecule(format, molecule, stream);
        Check(result == kReadOne || (result >= kNoName && result <= kIllegalCharacter));
        if (result != kReadOne)
            return;
        Check(molecule.SequenceLength() == static_cast<int>(molecule.Sequence().size()));
        if (IsPlain(molecule))
            CheckWritersReadBack(molecule);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string text(reinterpret_cast<const char*>(data), size);
    CSxStream stream(text);
    CRecognition recognition = Recognise(stream);
    Check(recognition.type >= kTypeUnknown && recognition.type <= kTypeProtein);
    std::size_t lineCount = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n') +
                                                     std::count(text.begin(), text.end(), '\r'));
    for (int format : {kFormatGenBank, kFormatEmbl, kFormatFasta, kFormatRaw, kFormatSuite}) {
        for (int kind : {kKindNucleic, kKindProtein}) {
            ReadEveryRecord(format, kind, text, lineCount);
        }
    }
    return 0;
}
