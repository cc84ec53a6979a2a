// Reading and writing block project files.

#include "BlockProject.h"
#include "archive/FileIO.h"

namespace {

// Blocks and links of a loaded project must name its molecule entries and stay within the
// entries' residues (block layouts only within bounds that keep sums from overflowing).
void CheckBlock(const CSimBlock& block, int entryCount) {
    constexpr int kMax = CLink::kMaxValue;
    for (int layout : {CSimBlock::kOriginal, CSimBlock::kCurrent}) {
        const auto which = static_cast<CSimBlock::Layout>(layout);
        bool bad = block.Width(which) < 0 || block.Width(which) > kMax;
        for (int i = 0; i < block.MemberCount() && !bad; ++i) {
            bad = block.Member(i) < 0 || block.Member(i) >= entryCount ||
                  block.Start(which, i) < 0 || block.Start(which, i) > kMax;
        }
        if (bad)
            throw CArchiveException(CArchiveException::genericError, "block out of range");
    }
}

void CheckLink(const CLink& link, const CSimBlockSet& blockSet) {
    for (int k = 0; k < link.MoleculeCount(); ++k) {
        const CSxMolEntry* entry = blockSet.MoleculeAt(link.Molecule(k));
        if (!entry ||
            link.Position(k) + link.Length(k) > static_cast<long long>(entry->Sequence().size())) {
            throw CArchiveException(CArchiveException::genericError, "link out of range");
        }
    }
}

}  // namespace

void CBlockProject::Serialize(CArchive& ar) {
    ar.XData(m_params);
    ar.XPointer(m_molecules);
    ar.XData(m_blockSet);
    ar.XData(m_links);
    if (!ar.IsLoading())
        return;
    if (!m_molecules)
        m_molecules = std::make_unique<CMolList>(kTypeProtein);
    CheckLoaded();
    RestartHistory();
}

void CBlockProject::CheckLoaded() const {
    for (int b = 0; b < m_blockSet.BlockCount(); ++b) {
        CheckBlock(*m_blockSet.BlockAt(b), m_blockSet.MoleculeCount());
    }
    for (const auto& link : m_links)
        CheckLink(*link, m_blockSet);
}

std::vector<std::uint8_t> CBlockProject::ToBytes() const {
    CArchive ar = CArchive::ForWriting();
    std::string tag = kFileTag;
    ar.XMember(tag);
    // The archive stores through an owning pointer; this one is released before it could
    // delete the project.
    std::unique_ptr<CBlockProject> self(const_cast<CBlockProject*>(this));
    try {
        ar.XPointer(self);
    } catch (...) {
        self.release();
        throw;
    }
    self.release();
    return ar.Bytes();
}

void CBlockProject::Save(const std::string& path) const {
    WriteFileAtomically(path, ToBytes());
}

bool CBlockProject::IsBlockProjectData(std::span<const std::uint8_t> bytes) {
    return CArchive::LeadingString(bytes) == kFileTag;
}

std::unique_ptr<CBlockProject> CBlockProject::FromBytes(std::span<const std::uint8_t> bytes) {
    return CArchive::ReadSigned<CBlockProject>(bytes, kFileTag);
}

std::unique_ptr<CBlockProject> CBlockProject::Load(const std::string& path) {
    return FromBytes(ReadWholeFile(path));
}

CBlockProject::OpenResult CBlockProject::Open(const std::string& path, IUserPrompt& prompt) {
    try {
        std::unique_ptr<CBlockProject> loaded = Load(path);
        if (!loaded)
            return kNotBlockProject;
        *this = std::move(*loaded);
        return kOpened;
    } catch (const CFileException&) {
        prompt.ShowMessage("Error opening '" + path + "' file", MessageIcon::error);
    } catch (const CArchiveException& e) {
        prompt.ShowMessage(e.Report(FileNameOf(path)), MessageIcon::error);
    }
    return kOpenFailed;
}

TB_REGISTER_CLASS(CBlockProject);
