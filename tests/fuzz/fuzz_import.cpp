// Sequence file import: recognition and every reader, for both molecule kinds, on the same
// bytes (see ReaderFuzz.h for what they must give).
#include "ReaderFuzz.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    for (int format : {kFormatGenBank, kFormatEmbl, kFormatFasta, kFormatRaw, kFormatSuite})
        fuzz::FuzzReader(format, data, size);
    return 0;
}
