#include "BlockProject.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <map>

#include "SimTool.h"
#include "molecule/MolEntryOf.h"
#include "molecule/MolListException.h"

bool RunSearchJob(CSearchJob& job) {
    CSimTool tool(job.matrix, job.parameters, job.molecules, &job.result);
    return tool.Run() == 1;
}

CBlockProject::CBlockProject() : m_molecules(std::make_unique<CMolList>(kTypeProtein)) {}

CBlockProject::CBlockProject(const std::string& settingsDir) : CBlockProject() {
    const std::filesystem::path path = std::filesystem::path(settingsDir) / kDefaultTemplateName;
    m_params.LoadTemplate(path.string(), nullptr);
}

CBlockProject::CBlockProject(const CBlockProject& other)
    : m_molecules(std::make_unique<CMolList>(*other.m_molecules)),
      m_blockSet(other.m_blockSet),
      m_links(other.m_links),
      m_params(other.m_params),
      m_history(other.m_history) {
    RemapEntryKeys(other);
}

CBlockProject& CBlockProject::operator=(const CBlockProject& other) {
    if (this != &other)
        *this = CBlockProject(other);
    return *this;
}

CBlockProject::~CBlockProject() = default;

void CBlockProject::RemapEntryKeys(const CBlockProject& source) {
    std::map<std::string, std::string> newKeys;
    for (int i = 0; i < source.MoleculeCount(); ++i) {
        newKeys[source.MoleculeAt(i)->Key()] = MoleculeAt(i)->Key();
    }
    CSimBlockSet remapped;
    remapped.SetSearchParameters(m_blockSet.Cutoff(), m_blockSet.MinSequences());
    for (const auto& entry : m_blockSet.Molecules().items) {
        auto key = newKeys.find(entry->Key());
        remapped.AddMolecule(CSxMolEntry(key == newKeys.end() ? entry->Key() : key->second,
                                         entry->Name(), entry->Sequence()));
    }
    // The blocks are in block order already, so adding them in turn keeps that order.
    for (int b = 0; b < m_blockSet.BlockCount(); ++b) {
        remapped.AddBlockSorted(std::make_unique<CSimBlock>(*m_blockSet.BlockAt(b)));
    }
    m_blockSet = std::move(remapped);
}

std::string CBlockProject::ImportExceptionMessage(const CMolListException& exception) {
    return std::string("CMolListException occured\n") + exception.what();
}

bool CBlockProject::AddFile(const std::string& path, IUserPrompt& prompt) {
    try {
        return m_molecules->AddFile(path, prompt);
    } catch (const CMolListException& e) {
        prompt.ShowMessage(ImportExceptionMessage(e), MessageIcon::error);
        return false;
    }
}

CSxMolX* CBlockProject::BlockMoleculeAt(int entryIndex) const {
    const CSxMolEntry* entry = m_blockSet.MoleculeAt(entryIndex);
    return entry ? FindByKey(entry->Key()) : nullptr;
}

std::vector<const CSxMolX*> CBlockProject::AllMolecules() const {
    std::vector<const CSxMolX*> molecules;
    for (int i = 0; i < MoleculeCount(); ++i)
        molecules.push_back(MoleculeAt(i));
    return molecules;
}

int CBlockProject::MoleculeUse(const std::string& name) const {
    const CSxMolX* molecule = FindByName(name);
    return molecule ? m_blockSet.MoleculeUse(molecule->Key()) : CSimBlockSet::kNotInSet;
}

std::string CBlockProject::DeleteQuestion(const std::string& name) const {
    std::string question = "Are you sure you want to delete '" + name + "' from the project?";
    if (MoleculeUse(name) == CSimBlockSet::kInBlocks) {
        question += "\n(all blocks it participates in will be dismissed)";
    }
    return question;
}

void CBlockProject::DeleteMolecule(const std::string& name) {
    const CSxMolX* molecule = FindByName(name);
    if (!molecule)
        return;
    const std::string key = molecule->Key();
    const int entry = m_blockSet.IndexOfMolecule(key);
    if (entry >= 0) {
        for (int b = m_blockSet.BlockCount() - 1; b >= 0; --b) {
            const CSimBlock* block = m_blockSet.BlockAt(b);
            if (m_blockSet.BlockHasMolecule(*block, key))
                m_blockSet.RemoveBlock(block);
        }
        m_blockSet.RemoveMolecule(key);
        m_blockSet.ShiftMemberIndices(entry);
        m_links.RemoveMolecule(entry);
        RestartHistory();
    }
    m_molecules->DeleteByName(name);
}

bool CBlockProject::RenameMolecule(const std::string& oldName, const std::string& newName,
                                   IUserPrompt& prompt) {
    return m_molecules->Rename(oldName, newName, prompt);
}

CSearchJob CBlockProject::PrepareSearch(const std::vector<const CSxMolX*>& selected) const {
    CSearchJob job{m_params.Matrix(), m_params.SearchParameters(), {}, m_blockSet};
    // Never below the lower limit, so that a project file always holds a valid minimum (a
    // search of fewer molecules fails anyway).
    const int count = std::max(static_cast<int>(selected.size()), kMinMinSequences);
    if (job.parameters.MinSequences() > count)
        job.parameters.SetMinSequences(count);
    for (const CSxMolX* molecule : selected)
        job.molecules.push_back(MolEntryOf(molecule));
    return job;
}

void CBlockProject::InstallSearchResult(CSearchJob&& job) {
    m_params.SetMinSequences(job.parameters.MinSequences());
    m_links.RemoveAll();
    m_blockSet = std::move(job.result);
    for (int b = 0; b < m_blockSet.BlockCount(); ++b) {
        m_blockSet.BlockAt(b)->SetColour(BlockColour(b));
    }
    RestartHistory();
}

bool CBlockProject::Search(const std::vector<const CSxMolX*>& selected, const SearchRunner& run,
                           IUserPrompt& prompt) {
    const std::string refusal = CSimTool::TooManyMoleculesMessage(selected.size());
    if (!refusal.empty()) {
        prompt.ShowMessage(refusal, MessageIcon::exclamation);
        return false;
    }
    CSearchJob job = PrepareSearch(selected);
    if (!run(job))
        return false;
    InstallSearchResult(std::move(job));
    return true;
}

std::uint32_t CBlockProject::BlockColourById(int identifier) const {
    const CSimBlock* block = m_blockSet.FindBlock(identifier);
    return block ? block->Colour() : kNoColour;
}

CAlignmentLayout CBlockProject::Layout() const {
    std::vector<CAlignmentRowSource> sources;
    for (int i = 0; i < MoleculeCount(); ++i) {
        const CSxMolX* molecule = MoleculeAt(i);
        sources.push_back(
            {molecule->Name(), molecule->Sequence(), m_blockSet.IndexOfMolecule(molecule->Key())});
    }
    return CAlignmentLayout(std::move(sources), m_links);
}

void CBlockProject::RestartHistory() {
    m_history.Clear();
    m_history.Push(m_links);
}

bool CBlockProject::Link(std::span<const ALN_BSEL_ENTRY> selection, IUserPrompt& prompt,
                         std::vector<ALN_BSEL_ENTRY>* linkedColumns) {
    std::unique_ptr<CLink> request = MakeLinkRequest(Layout(), selection);
    if (!request)
        return false;
    const int molecule = request->Molecule(0);
    const int position = request->Position(0);
    if (!m_links.Add(std::move(request))) {
        prompt.ShowMessage(kCannotLinkMessage, MessageIcon::exclamation);
        return false;
    }
    m_history.Push(m_links);
    if (linkedColumns)
        *linkedColumns = ColumnsOfLinkHolding(molecule, position);
    return true;
}

std::vector<ALN_BSEL_ENTRY> CBlockProject::ColumnsOfLinkHolding(int molecule, int position) const {
    const CAlignmentLayout layout = Layout();
    for (const auto& link : m_links) {
        const int k = link->IndexOfMolecule(molecule);
        if (k < 0 || position < link->Position(k) ||
            position >= link->Position(k) + link->Length(k)) {
            continue;
        }
        std::vector<ALN_BSEL_ENTRY> columns;
        for (int i = 0; i < link->MoleculeCount(); ++i) {
            const int row = layout.RowOfEntry(link->Molecule(i));
            if (row < 0 || link->Length(i) <= 0)
                continue;
            columns.push_back(
                {layout.RowAt(row).name, link->Column(), link->Column() + link->Length(i)});
        }
        return columns;
    }
    return {};
}

bool CBlockProject::Unlink(std::span<const ALN_BSEL_ENTRY> selection) {
    std::unique_ptr<CLink> request = MakeUnlinkRequest(Layout(), selection);
    if (!request || !m_links.Unlink(*request))
        return false;
    m_history.Push(m_links);
    return true;
}

void CBlockProject::UnlinkAll() {
    m_links.RemoveAll();
    m_history.Push(m_links);
}

std::string CBlockProject::NextDefinedBlockName() const {
    long highest = 0;
    for (int b = 0; b < m_blockSet.BlockCount(); ++b) {
        const CSimBlock* block = m_blockSet.BlockAt(b);
        const std::size_t at = block->Name().find("ud");
        if (block->Flag() == 0 || at == std::string::npos)
            continue;
        highest = std::max(highest, std::strtol(block->Name().c_str() + at + 2, nullptr, 10));
    }
    return "ud" + std::to_string(highest + 1);
}

const CSimBlock* CBlockProject::DefineBlock(std::span<const ALN_BSEL_ENTRY> selection) {
    const std::optional<CBlockRequest> request = MakeBlockRequest(Layout(), selection);
    if (!request)
        return nullptr;
    constexpr int kUserDefined = 1;
    auto block = std::make_unique<CSimBlock>();
    block->Init(request->members, request->starts, request->width, 0, kUserDefined);
    const int score =
        block->LayoutScore(CSimBlock::kOriginal, m_blockSet.Molecules(), m_params.Matrix(), 0);
    block->Init(request->members, request->starts, request->width, score, kUserDefined);
    block->SetName(NextDefinedBlockName());
    CSimBlock* added = block.get();
    m_blockSet.AddBlockSorted(std::move(block));
    added->SetColour(BlockColour(m_blockSet.BlockCount()));
    return added;
}

CMsfExport CBlockProject::BuildMsf() const {
    CMsfExport msf;
    msf.Build(Layout(), m_blockSet.MoleculeCount());
    return msf;
}
