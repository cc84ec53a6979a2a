#include "import/Readers.h"

#include "import/ImportResult.h"
#include "import/Recognise.h"

int ReadMolecule(int format, CSxMol& molecule, CSxStream& stream) {
    switch (format) {
        case kFormatGenBank:
            return ReadGenBank(molecule, stream);
        case kFormatEmbl:
            return ReadEmbl(molecule, stream);
        case kFormatFasta:
            return ReadFasta(molecule, stream);
        case kFormatRaw:
            return ReadRaw(molecule, stream);
        case kFormatSuite:
            return ReadSuiteText(molecule, stream);
        default:
            return kFormatNotSupported;
    }
}
