// The suite's molecule text format: each line is a numeric record code and fields separated by
// '|'. 212 starts a molecule (second field: its name), 213 and 214 give its definition and an
// accession number, 209 appends a piece of sequence, 210 ends the molecule and 207 ends the
// file.

#include <cstdlib>

#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/SeqText.h"

namespace {

enum SuiteRecord {
    kEndOfFile = 207,
    kSequencePiece = 209,
    kEndOfMolecule = 210,
    kMoleculeStart = 212,
    kDefinition = 213,
    kAccession = 214,
};

std::vector<std::string> FieldsOf(const std::string& line) {
    std::vector<std::string> fields;
    std::size_t pos = 0;
    for (;;) {
        std::size_t bar = line.find('|', pos);
        fields.push_back(line.substr(pos, bar == std::string::npos ? bar : bar - pos));
        if (bar == std::string::npos)
            return fields;
        pos = bar + 1;
    }
}

int RecordCode(const std::string& field) {
    return StartsWithNonZeroNumber(field) && field.size() < 10 ? std::atoi(field.c_str()) : 0;
}

std::string Field(const std::vector<std::string>& fields, std::size_t index) {
    return index < fields.size() ? Trim(fields[index]) : std::string();
}

}  // namespace

int ReadSuiteText(CSxMol& molecule, CSxStream& stream) {
    molecule.ClearForReading();
    std::string line;
    bool started = false;
    std::string sequence;
    while (stream.ReadLine(line)) {
        std::vector<std::string> fields = FieldsOf(line);
        int code = RecordCode(Trim(fields[0]));
        if (started && (code == kEndOfFile || code == kMoleculeStart)) {
            // The molecule lacks its end record: it ends where the next one (or the file) starts.
            stream.UnreadLine();
            break;
        }
        if (code == kEndOfFile)
            return kNoMoreRecords;
        if (code == kMoleculeStart) {
            started = true;
            stream.MarkRecordStart();
            molecule.SetName(Field(fields, 1));
        } else if (!started) {
            continue;
        } else if (code == kDefinition) {
            molecule.Description().definition = Field(fields, 1);
        } else if (code == kAccession) {
            molecule.Description().accessions.push_back(Field(fields, 1));
        } else if (code == kSequencePiece) {
            AppendResidues(sequence, Field(fields, 1));
        } else if (code == kEndOfMolecule) {
            break;
        }
    }
    if (!started)
        return kNoMoreRecords;
    if (molecule.Name().empty())
        return kNoName;
    if (sequence.empty())
        return kNoSequence;
    molecule.SetSequence(std::move(sequence));
    return kReadOne;
}
