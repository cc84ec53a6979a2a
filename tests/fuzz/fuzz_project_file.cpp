// Block project files from untrusted bytes: reading either fails with an archive error or gives
// a project that can be laid out, exported, edited and written again.
#include <cstdint>
#include <vector>

#include "BlockProject.h"
#include "BroadcastRecord.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::span<const std::uint8_t> bytes(data, size);
    CBroadcastRecord::FromBytes(bytes, 0);
    std::unique_ptr<CBlockProject> project;
    try {
        project = CBlockProject::FromBytes(bytes);
    } catch (const CArchiveException&) {
        return 0;
    }
    if (!project)
        return 0;
    CMsfExport msf = project->BuildMsf();
    if (msf.IsWritable())
        msf.Write();
    // Unlink a little of every row, then link the first columns of the first two rows.
    const CAlignmentLayout layout = project->Layout();
    std::vector<ALN_BSEL_ENTRY> rows;
    for (int r = 0; r < layout.RowCount() && r < 8; ++r)
        rows.push_back({layout.RowAt(r).name, 0, 3});
    project->Unlink(rows);
    CRecordingPrompt prompt;
    if (rows.size() >= 2)
        project->Link(std::span(rows).first(2), prompt);
    project->DefineBlock(rows);
    const std::vector<std::uint8_t> written = project->ToBytes();
    // What was written reads back.
    CBlockProject::FromBytes(written);
    return 0;
}
