// Reading and writing block project files.

#include <map>
#include <set>

#include "BlockProject.h"
#include "archive/FileIO.h"

namespace {

[[noreturn]] void Refuse(const std::string& why) {
    throw CArchiveException(CArchiveException::genericError, why);
}

std::string Quoted(const std::string& name) {
    return "\"" + name + "\"";
}

// Names find a molecule's rows (panes, --rows, MSF) and keys find its block entry, so both
// must be unique; a nameless molecule could be neither shown nor named.
void CheckMolecules(const CMolList& molecules) {
    std::set<std::string> names;
    std::set<std::string> keys;
    for (int i = 0; i < molecules.Count(); ++i) {
        const CSxMolX& molecule = *molecules.At(i);
        if (molecule.Name().empty())
            Refuse("molecule " + std::to_string(i + 1) + " has no name");
        if (!names.insert(molecule.Name()).second)
            Refuse("two molecules are named " + Quoted(molecule.Name()));
        if (!keys.insert(molecule.Key()).second)
            Refuse("two molecules share the key " + molecule.Key());
    }
}

// What blocks and links may refer to in a molecule entry of the block set.
struct CEntryExtent {
    std::string name;
    long long residues = 0;
    bool shown = false;  // a molecule of the project shows the entry as a row
};

// Entries name distinct molecules; one that names a molecule of the project has its residues,
// since the alignment lays out the molecule's sequence where blocks and links point.
std::vector<CEntryExtent> CheckEntries(const CSimBlockSet& blockSet, const CMolList& molecules) {
    std::map<std::string, const CSxMolX*> byKey;
    for (int i = 0; i < molecules.Count(); ++i)
        byKey.emplace(molecules.At(i)->Key(), molecules.At(i));
    std::set<std::string> keys;
    std::vector<CEntryExtent> extents;
    for (const auto& entry : blockSet.Molecules().items) {
        if (!keys.insert(entry->Key()).second)
            Refuse("two block entries name the molecule " + Quoted(entry->Name()));
        const auto molecule = byKey.find(entry->Key());
        const bool shown = molecule != byKey.end();
        if (shown && molecule->second->Sequence().size() != entry->Sequence().size()) {
            Refuse("the block entry of " + Quoted(molecule->second->Name()) +
                   " differs in length from the molecule");
        }
        extents.push_back({entry->Name(), static_cast<long long>(entry->Sequence().size()), shown});
    }
    return extents;
}

// Each layout of a block has a width and places every member it holds within the member's
// residues; members are distinct entries. Values stay within bounds that keep sums from
// overflowing, even for members the current layout leaves out.
void CheckBlock(const CSimBlock& block, int index, const std::vector<CEntryExtent>& entries) {
    constexpr int kMax = CLink::kMaxValue;
    const std::string which = "block " + std::to_string(index + 1);
    if (block.MemberCount() == 0)
        Refuse(which + " has no members");
    std::set<int> members;
    for (int i = 0; i < block.MemberCount(); ++i) {
        const int member = block.Member(i);
        if (member < 0 || member >= static_cast<int>(entries.size()))
            Refuse(which + " names a molecule entry the project does not hold");
        if (!members.insert(member).second)
            Refuse(which + " holds " + Quoted(entries[member].name) + " twice");
    }
    for (const CSimBlock::Layout layout : {CSimBlock::kOriginal, CSimBlock::kCurrent}) {
        const int width = block.Width(layout);
        if (width < 1 || width > kMax)
            Refuse(which + " has a width of " + std::to_string(width));
        for (int i = 0; i < block.MemberCount(); ++i) {
            const int start = block.Start(layout, i);
            if (start < 0 || start > kMax)
                Refuse(which + " starts at " + std::to_string(start));
            const CEntryExtent& entry = entries[block.Member(i)];
            if (block.InLayout(layout, i) && start + width > entry.residues) {
                Refuse(which + " reaches past the end of " + Quoted(entry.name) + " (" +
                       std::to_string(entry.residues) + " residues)");
            }
        }
    }
}

// A link places stretches of shown molecules, each within the molecule's residues.
void CheckLink(const CLink& link, int index, const std::vector<CEntryExtent>& entries) {
    const std::string which = "link " + std::to_string(index + 1);
    for (int k = 0; k < link.MoleculeCount(); ++k) {
        const int molecule = link.Molecule(k);
        if (molecule >= static_cast<int>(entries.size()) || !entries[molecule].shown)
            Refuse(which + " names a molecule the project does not hold");
        const CEntryExtent& entry = entries[molecule];
        if (static_cast<long long>(link.Position(k)) + link.Length(k) > entry.residues) {
            Refuse(which + " reaches past the end of " + Quoted(entry.name) + " (" +
                   std::to_string(entry.residues) + " residues)");
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
    CheckMolecules(*m_molecules);
    const std::vector<CEntryExtent> entries = CheckEntries(m_blockSet, *m_molecules);
    for (int b = 0; b < m_blockSet.BlockCount(); ++b)
        CheckBlock(*m_blockSet.BlockAt(b), b, entries);
    for (int l = 0; l < m_links.Count(); ++l)
        CheckLink(m_links.At(l), l, entries);
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
    const std::vector<std::uint8_t> bytes = ToBytes();
    // A file is replaced only by a project that reads back.
    try {
        FromBytes(bytes);
    } catch (const CArchiveException& e) {
        throw CFileException(path, std::string("the project would not read back: ") + e.what());
    }
    WriteFileAtomically(path, bytes);
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
        // The cause, then what exactly was wrong.
        prompt.ShowMessage(FileNameOf(path) + "\n" + e.what(), MessageIcon::error);
    }
    return kOpenFailed;
}

TB_REGISTER_CLASS(CBlockProject);
