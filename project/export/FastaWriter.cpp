// FASTA and raw sequence files; their lines end with CR LF.

#include <algorithm>

#include "export/SequenceWriters.h"
#include "import/SeqText.h"

namespace {

constexpr std::size_t kFastaLineLength = 70;
constexpr const char* kLineEnd = "\r\n";

std::string CasedSequence(const CSxMol& molecule) {
    return molecule.Kind() == kKindProtein ? ToUpper(molecule.Sequence())
                                           : ToLower(molecule.Sequence());
}

}  // namespace

void WriteFasta(const CSxMol& molecule, std::string& out) {
    std::string name = molecule.Name();
    std::replace(name.begin(), name.end(), ' ', '\\');
    out += ">" + name + kLineEnd;
    std::string sequence = CasedSequence(molecule);
    for (std::size_t pos = 0; pos < sequence.size(); pos += kFastaLineLength) {
        out += sequence.substr(pos, kFastaLineLength) + kLineEnd;
    }
    out += kLineEnd;
}

void WriteRaw(const CSxMol& molecule, std::string& out) {
    out += CasedSequence(molecule) + kLineEnd;
}
