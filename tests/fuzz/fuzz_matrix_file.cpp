// Matrix text files come from users and other programs: any bytes must read or fail cleanly,
// and a matrix that was read must write out as text that reads back to the same matrix. The
// lines after the rows are the statistics section: what it gives must be one entry per number
// of sequences, each with constants that are numbers of 0 or more.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <set>
#include <string_view>

#include "ScoreMatrix.h"

namespace {

bool SoundStatistics(const CStatTable& statistics) {
    std::set<std::int32_t> seen;
    for (const auto& entry : statistics.Entries()) {
        if (!seen.insert(entry->sequences).second || entry->sequences < 1 ||
            !std::isfinite(entry->lambda) || !std::isfinite(entry->k) || entry->lambda < 0 ||
            entry->k < 0) {
            return false;
        }
    }
    return true;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    CScoreMatrix matrix;
    if (!matrix.ReadText(text, "fuzz")) {
        if (matrix.LastError().empty() || matrix.IsValid())
            std::abort();
        return 0;
    }
    if (!matrix.IsValid() ||
        matrix.Scores().size() != static_cast<std::size_t>(matrix.Size()) * matrix.Size() ||
        !SoundStatistics(matrix.Statistics()) || matrix.DefaultCutoff().value_or(1) < 1) {
        std::abort();
    }
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
