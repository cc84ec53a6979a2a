#pragma once
// The whole working state of the program: the molecules, the blocks of the last search, the
// links in force with their undo history, and the parameters. The document (GUI) and the
// command-line tool run every project command through this class; it shows nothing itself and
// reports through the IUserPrompt its callers pass.

#include <functional>
#include <memory>
#include <span>
#include <string>
#include <vector>

#include "QuilterParams.h"
#include "ScoreMatrix.h"
#include "SimBlockParameters.h"
#include "SimBlockSet.h"
#include "UserPrompt.h"
#include "layout/AlignmentLayout.h"
#include "layout/Selection.h"
#include "links/LinkHistory.h"
#include "links/LinkList.h"
#include "molecule/MolList.h"
#include "molecule/MolListException.h"
#include "msf/MsfExport.h"

// Everything a block search reads, copied from the project when the search starts, and the
// working block set it fills. The project takes the result only after a complete run.
struct CSearchJob {
    CScoreMatrix matrix;
    CSimBlockParameters parameters;
    std::vector<CSxMolEntry> molecules;  // in selection order
    CSimBlockSet result;
};

// Runs a prepared search (on any thread; the project is not touched meanwhile) and answers
// whether it completed. The GUI runs a progress-reporting engine behind its dialog, the
// command-line tool its own; RunSearchJob is the plain one.
using SearchRunner = std::function<bool(CSearchJob& job)>;
bool RunSearchJob(CSearchJob& job);

class CBlockProject : public CSerializable {
  public:
    TB_CLASS_TAG("BlockProject")
    // The leading string of a project file.
    static constexpr const char* kFileTag = "BlockProject";
    static constexpr const char* kDefaultTemplateName = "default.bp1";

    // An empty protein project with the default parameters.
    CBlockProject();
    // The same, then the parameters of "default.bp1" in `settingsDir` (silently the defaults
    // when it is missing or damaged).
    explicit CBlockProject(const std::string& settingsDir);
    // Deep copies: every molecule is copied with a new key, and the copy's block set refers to
    // the new keys.
    CBlockProject(const CBlockProject& other);
    CBlockProject& operator=(const CBlockProject& other);
    CBlockProject(CBlockProject&&) noexcept = default;
    CBlockProject& operator=(CBlockProject&&) noexcept = default;
    ~CBlockProject() override;

    // Molecules.
    //
    // Imports every molecule of a sequence file; false when nothing could be added (an
    // unreadable file is reported as "CMolListException occured" and, on a second line, the
    // file and why).
    bool AddFile(const std::string& path, IUserPrompt& prompt);
    int MoleculeCount() const { return m_molecules->Count(); }
    int MoleculeType() const { return m_molecules->MolType(); }
    // Null when out of range.
    CSxMolX* MoleculeAt(int index) const { return m_molecules->At(index); }
    // The project molecule of block-set entry `entryIndex` (by key), or null.
    CSxMolX* BlockMoleculeAt(int entryIndex) const;
    CSxMolX* FindByName(const std::string& name) const { return m_molecules->FindByName(name); }
    CSxMolX* FindByKey(const std::string& key) const { return m_molecules->FindByKey(key); }
    int IndexOfName(const std::string& name) const { return m_molecules->IndexOfName(name); }
    std::vector<const CSxMolX*> AllMolecules() const;
    const CMolList& Molecules() const { return *m_molecules; }
    // CSimBlockSet::MoleculeUse of the named molecule (kNotInSet when there is none).
    int MoleculeUse(const std::string& name) const;
    // The question asked before deleting the molecule.
    std::string DeleteQuestion(const std::string& name) const;
    // Deletes the molecule; the blocks it takes part in are dismissed, its block-set entry
    // removed and its stretches unlinked (the link history then restarts from the new links,
    // since older snapshots name entries by their old indices).
    void DeleteMolecule(const std::string& name);
    // Refuses a name another molecule has, with a message; renaming to the same name is fine.
    bool RenameMolecule(const std::string& oldName, const std::string& newName,
                        IUserPrompt& prompt);

    // Search.
    //
    // Searches the selected molecules: more than the engine can hold is refused with a message
    // before anything runs. The search runs with the minimum sequences lowered to the number of
    // molecules when larger. Only a complete run changes the project: the links are cleared, the
    // result installed and coloured, the lowered minimum kept and the history restarted.
    bool Search(const std::vector<const CSxMolX*>& selected, const SearchRunner& run,
                IUserPrompt& prompt);
    CSearchJob PrepareSearch(const std::vector<const CSxMolX*>& selected) const;
    void InstallSearchResult(CSearchJob&& job);

    // Blocks.
    const CSimBlockSet& BlockSet() const { return m_blockSet; }
    CSimBlockSet& BlockSet() { return m_blockSet; }
    // Palette entry index modulo the palette size.
    std::uint32_t BlockColour(int index) const { return m_params.BlockColour(index); }
    // The colour of the block with that identifier, kNoColour when there is none.
    std::uint32_t BlockColourById(int identifier) const;

    // The alignment and what is done on its selections.
    //
    // The rows of every molecule in project order, laid out by the current links.
    CAlignmentLayout Layout() const;
    // Links the selection; a link that contradicts the links in force is refused with "Block can
    // not be linked.". On success the history gets the new state and `linkedColumns` (when
    // given) the columns of the link now holding the selection.
    bool Link(std::span<const ALN_BSEL_ENTRY> selection, IUserPrompt& prompt,
              std::vector<ALN_BSEL_ENTRY>* linkedColumns = nullptr);
    // True when a link changed (the history then gets the new state).
    bool Unlink(std::span<const ALN_BSEL_ENTRY> selection);
    void UnlinkAll();
    bool HasLinks() const { return !m_links.IsEmpty(); }
    const CLinkList& Links() const { return m_links; }
    // A block of the selected rows (defined by the user, named "ud" and a number); null when
    // the selection does not make one.
    const CSimBlock* DefineBlock(std::span<const ALN_BSEL_ENTRY> selection);

    // Link history.
    bool CanUndo() const { return m_history.CanUndo(); }
    bool CanRedo() const { return m_history.CanRedo(); }
    bool Undo() { return m_history.Undo(m_links); }
    bool Redo() { return m_history.Redo(m_links); }
    const CLinkHistory& History() const { return m_history; }

    // Parameters.
    const CQuilterParams& Params() const { return m_params; }
    CQuilterParams& Params() { return m_params; }

    // The MSF record of the current alignment.
    CMsfExport BuildMsf() const;

    // Files.
    //
    // The project file's bytes and its atomic save. Throws CFileException, also when the bytes
    // would not read back, so that a file is never replaced by a project that cannot be opened.
    std::vector<std::uint8_t> ToBytes() const;
    void Save(const std::string& path) const;
    // Reads a project file into a new project; null when the data is not a block project.
    // Throws CFileException or CArchiveException.
    static std::unique_ptr<CBlockProject> Load(const std::string& path);
    static std::unique_ptr<CBlockProject> FromBytes(std::span<const std::uint8_t> bytes);
    static bool IsBlockProjectData(std::span<const std::uint8_t> bytes);
    enum OpenResult { kOpened, kNotBlockProject, kOpenFailed };
    // Replaces this project by the file's only when the whole file was read; a failure is
    // reported through `prompt` and leaves the project as it was.
    OpenResult Open(const std::string& path, IUserPrompt& prompt);

    // Parameters, molecule list, block set and links. A loaded project is checked for all that
    // later commands rely on (unique molecule names and keys, blocks and links within the
    // residues of the molecules they name) and its history holds the loaded links only.
    void Serialize(CArchive& ar) override;

    // The message for a file that could not be read at all: the fixed first line, then the file
    // and the system's reason.
    static std::string ImportExceptionMessage(const CMolListException& exception);

  private:
    void RemapEntryKeys(const CBlockProject& source);
    void RestartHistory();
    std::string NextDefinedBlockName() const;
    std::vector<ALN_BSEL_ENTRY> ColumnsOfLinkHolding(int molecule, int position) const;
    void CheckLoaded() const;

    std::unique_ptr<CMolList> m_molecules;
    CSimBlockSet m_blockSet;
    CLinkList m_links;
    CQuilterParams m_params;
    CLinkHistory m_history;
};
