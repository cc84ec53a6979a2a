#include <algorithm>

#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/SeqText.h"

namespace {

constexpr std::string_view kNameDelimiters = " ;\f\r\n";

// The name on a header line: after the first '>', delimiters skipped, up to the next
// delimiter; '\' stands for a blank and '|' becomes '_'.
std::string NameOfHeader(std::string_view line) {
    std::string_view rest = line.substr(line.find('>') + 1);
    std::size_t start = rest.find_first_not_of(kNameDelimiters);
    if (start == std::string_view::npos)
        return {};
    rest.remove_prefix(start);
    std::string name(rest.substr(0, rest.find_first_of(kNameDelimiters)));
    std::replace(name.begin(), name.end(), '\\', ' ');
    std::replace(name.begin(), name.end(), '|', '_');
    name.erase(0, name.find_first_not_of(' '));
    return name;
}

bool IsHeader(std::string_view line) {
    return line.find('>') != std::string_view::npos;
}

}  // namespace

int ReadFasta(CSxMol& molecule, CSxStream& stream) {
    molecule.ClearForReading();
    std::string line;
    bool found = false;
    while (stream.ReadLine(line)) {
        if (IsHeader(line)) {
            found = true;
            break;
        }
    }
    if (!found)
        return kNoMoreRecords;
    stream.MarkRecordStart();
    std::string name = NameOfHeader(line);

    // The record runs to the next header; blank lines inside it separate nothing.
    std::string sequence;
    while (stream.ReadLine(line)) {
        if (IsHeader(line)) {
            stream.UnreadLine();
            break;
        }
        AppendResidues(sequence, line);
    }
    if (sequence.empty())
        return kNoSequence;
    molecule.SetName(name.empty() ? "NONAME" : name);
    molecule.SetSequence(std::move(sequence));
    return kReadOne;
}
