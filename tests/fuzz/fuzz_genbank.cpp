// GenBank and GenPept flat files come from users and other programs; ReaderFuzz.h says what
// any bytes must give.
#include "ReaderFuzz.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::FuzzReader(kFormatGenBank, data, size);
}
