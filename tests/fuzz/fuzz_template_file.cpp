// Template files from untrusted bytes: either refused with an archive error or read into
// parameters that write back and read again.
#include <cstdint>

#include "QuilterParams.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    CQuilterParams params;
    try {
        if (!params.ReadTemplateBytes(std::span<const std::uint8_t>(data, size)))
            return 0;
    } catch (const CArchiveException&) {
        return 0;
    }
    params.SetCutoffFromMatrix();
    params.BlockColour(7);
    CQuilterParams again;
    again.ReadTemplateBytes(params.TemplateBytes());
    return 0;
}
