// Layout strings come from the settings file, which users may edit: any text must parse or fail
// cleanly, and what parses must compose into a string that parses to the same layout.
#include <cstdint>
#include <cstdlib>
#include <string>

#include "LayoutParser.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    const CLayoutParseResult first = ParseLayout(text, 8);
    if (!first.Ok()) {
        if (first.message.empty()) {
            std::abort();
        }
        return 0;
    }
    const std::string composed = ComposeLayout(first.root);
    const CLayoutParseResult second = ParseLayout(composed, 8);
    if (!second.Ok() || ComposeLayout(second.root) != composed) {
        std::abort();
    }
    return 0;
}
