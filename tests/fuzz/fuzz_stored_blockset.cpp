// Reads a stored block set from arbitrary bytes and uses what was read as the program would:
// block order and queries, significance, layout scores, copies and storing it again.

#include <cstdint>
#include <span>

#include "BlockSignificance.h"
#include "ScoreMatrix.h"
#include "SimBlockSet.h"

namespace {

void UseBlockSet(const CSimBlockSet& set) {
    static const CScoreMatrix matrix = [] {
        CScoreMatrix withStatistics("blosum62mt");
        withStatistics.Statistics().Set(2, 0.3, 0.1, false);
        withStatistics.Statistics().Set(16, 0.2, 0.05, true);
        return withStatistics;
    }();
    for (int b = 0; b < set.BlockCount(); ++b) {
        const CSimBlock& block = *set.BlockAt(b);
        for (CSimBlock::Layout layout : {CSimBlock::kOriginal, CSimBlock::kCurrent}) {
            block.HighestStart(layout);
            block.LowestStart(layout);
            block.MeanPairScore(layout);
            EvaluateBlockSignificance(block, &set, matrix, 0.0001, layout);
            if (block.MemberCount() <= 64)
                block.LayoutScore(layout, set.Molecules(), matrix, 0);
        }
        block.IsUnedited();
        set.IndexOfBlock(block);
        for (int i = 0; i < block.MemberCount(); ++i) {
            if (const CSxMolEntry* entry = set.MoleculeAt(block.Member(i)))
                set.BlockHasMolecule(block, entry->Key());
        }
    }
    for (int m = 0; m < set.MoleculeCount(); ++m)
        set.MoleculeUse(set.MoleculeAt(m)->Key());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    CSimBlockSet set;
    try {
        CArchive reader = CArchive::ForReading(std::span<const std::uint8_t>(data, size));
        set.Serialize(reader);
    } catch (const CArchiveException&) {
        return 0;
    }
    UseBlockSet(set);
    CSimBlockSet copy = set;
    if (copy.BlockCount() > 0) {
        copy.ShiftMemberIndices(0);
        copy.RemoveBlock(copy.BlockAt(0));
    }
    // What was read stores and reads back unchanged.
    CArchive writer = CArchive::ForWriting();
    set.Serialize(writer);
    CSimBlockSet again;
    CArchive reader = CArchive::ForReading(writer.Bytes());
    again.Serialize(reader);
    if (again.BlockCount() != set.BlockCount() || again.MoleculeCount() != set.MoleculeCount())
        __builtin_trap();
    for (int b = 0; b < set.BlockCount(); ++b) {
        if (!(*again.BlockAt(b) == *set.BlockAt(b)))
            __builtin_trap();
    }
    return 0;
}
