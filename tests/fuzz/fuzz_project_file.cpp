// Block project files from untrusted bytes: reading either fails with an archive error or gives
// a project that can be laid out, exported, edited, written again and read back.
#include <cstdint>
#include <cstdlib>
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
    if (project->MoleculeCount() > 2)
        project->DeleteMolecule(project->MoleculeAt(1)->Name());
    // A project that loaded saves and loads again: a refusal here is a fault of the checks made
    // on loading, so it is not caught.
    if (!CBlockProject::FromBytes(project->ToBytes()))
        std::abort();
    return 0;
}
