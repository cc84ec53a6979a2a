#include "export/SequenceWriters.h"

std::string ExportMolecules(const std::vector<const CSxMol*>& molecules, int filter) {
    using CWriter = void (*)(const CSxMol&, std::string&);
    CWriter writer = nullptr;
    switch (filter) {
        case kExportFlatFile:
            writer = WriteGenBank;
            break;
        case kExportSwissEmbl:
            writer = WriteEmbl;
            break;
        case kExportFasta:
            writer = WriteFasta;
            break;
        case kExportRaw:
            writer = WriteRaw;
            break;
        default:
            return {};
    }
    std::string out;
    for (const CSxMol* molecule : molecules)
        writer(*molecule, out);
    return out;
}
