// A stored score matrix comes from project and template files: any bytes must load or be
// refused with an archive error, and a matrix that loaded must store and load back unchanged.
#include <cstdint>
#include <cstdlib>
#include <span>

#include "ScoreMatrix.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    CScoreMatrix matrix;
    try {
        CArchive in = CArchive::ForReading(std::span(data, size));
        in.XData(matrix);
    } catch (const CArchiveException&) {
        if (matrix.IsValid() || !matrix.Name().empty())
            std::abort();  // a refusal changes nothing
        return 0;
    }
    if (matrix.Scores().size() != static_cast<std::size_t>(matrix.Size()) * matrix.Size()) {
        std::abort();
    }
    CArchive out = CArchive::ForWriting();
    out.XData(matrix);
    CScoreMatrix again;
    CArchive reread = CArchive::ForReading(out.Bytes());
    reread.XData(again);
    if (again.Name() != matrix.Name() || again.Alphabet() != matrix.Alphabet() ||
        again.Scores() != matrix.Scores() || again.Type() != matrix.Type() ||
        again.Statistics().Count() != matrix.Statistics().Count()) {
        std::abort();
    }
    return 0;
}
