#include <cctype>

#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/SeqText.h"

namespace {

constexpr std::string_view kSkipped = "- \t1234567890";

std::string_view AlphabetOf(int kind) {
    switch (kind) {
        case kKindNucleic:
            return "nagcturywsmkbdhv";
        case kKindProtein:
            return "xflsy*cwphqrimtnkvadegbz";
        default:
            return "nagcturywsmkbdhvxflsy*cwphqrimtnkvadegbz";
    }
}

}  // namespace

int ReadRaw(CSxMol& molecule, CSxStream& stream) {
    molecule.ClearForReading();
    std::string_view alphabet = AlphabetOf(molecule.Kind());
    std::string sequence;
    std::string line;
    bool started = false;
    bool illegal = false;
    // A record is a run of non-blank lines; a bad character spoils the whole run.
    while (stream.ReadLine(line)) {
        if (IsBlankLine(line)) {
            if (started)
                break;
            continue;
        }
        if (!started)
            stream.MarkRecordStart();
        started = true;
        for (char c : line) {
            char lower = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
            if (kSkipped.find(lower) != std::string_view::npos)
                continue;
            if (alphabet.find(lower) == std::string_view::npos) {
                if (!illegal)
                    stream.MarkProblem();
                illegal = true;
            }
            sequence += lower;
        }
    }
    if (!started)
        return kNoMoreRecords;
    if (illegal)
        return kIllegalCharacter;
    if (sequence.empty())
        return kNoSequence;
    molecule.SetName("NONAME");
    molecule.SetSequence(std::move(sequence));
    return kReadOne;
}
