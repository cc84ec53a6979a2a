// Matrix text files come from users and other programs: any bytes must read or fail cleanly,
// and a matrix that was read must write out as text that reads back to the same matrix.
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "ScoreMatrix.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    CScoreMatrix matrix;
    if (!matrix.ReadText(text, "fuzz")) {
        if (matrix.LastError().empty() || matrix.IsValid())
            std::abort();
        return 0;
    }
    if (!matrix.IsValid() ||
        matrix.Scores().size() != static_cast<std::size_t>(matrix.Size()) * matrix.Size()) {
        std::abort();
    }
    matrix.DefaultCutoff();
    matrix.ExpectedWindowScore();
    std::vector<std::uint8_t> codes;
    matrix.Encode(text.substr(0, 64), codes);

    CScoreMatrix again;
    if (!again.ReadText(matrix.ToText(), "fuzz") || !again.Equals(matrix) ||
        again.Statistics().Count() != matrix.Statistics().Count()) {
        std::abort();
    }
    return 0;
}
