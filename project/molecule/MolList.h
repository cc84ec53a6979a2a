#pragma once
// The molecules of a project, in the order they were added, all of one molecule type.

#include <memory>
#include <string>
#include <vector>

#include "UserPrompt.h"
#include "molecule/SxMolX.h"

class CMolList : public CSerializable {
  public:
    TB_CLASS_TAG("MolList")
    // `type`: kTypeUnknown until the first file decides, kTypeNucleic or kTypeProtein.
    explicit CMolList(int type = kTypeUnknown) : m_type(type) {}
    // Deep copy: every molecule is copied and so receives a new key.
    CMolList(const CMolList& other);
    CMolList& operator=(const CMolList&) = delete;

    // Imports every molecule of a sequence file: recognition, refusal of a file of the other
    // molecule type, the raw-sequence question, unique names. A record that cannot be read is
    // skipped and the rest are read; one message through `prompt` names the skipped records.
    // False when the file was refused, the question cancelled, or no molecule was read from it.
    // Throws CMolListException when the file cannot be read at all (or is beyond the size
    // limit of sequence files).
    bool AddFile(const std::string& path, IUserPrompt& prompt);

    int MolType() const { return m_type; }
    void SetMolType(int type) { m_type = type; }

    int Count() const { return static_cast<int>(m_molecules.size()); }
    // Null when index is out of range.
    CSxMolX* At(int index) const;
    // Exact, case-sensitive lookups in list order; null or -1 when absent.
    CSxMolX* FindByName(const std::string& name) const;
    CSxMolX* FindByKey(const std::string& key) const;
    int IndexOfName(const std::string& name) const;
    // Deletes the first molecule of that name; nothing when absent.
    void DeleteByName(const std::string& name);
    // Appends as is (no renaming); the list owns the molecule.
    void Append(std::unique_ptr<CSxMolX> molecule);

    // Renames the molecule called `oldName`. A new name that differs from the old one and
    // belongs to another molecule is refused with a message through `prompt`; false then, and
    // when no molecule is called `oldName`.
    bool Rename(const std::string& oldName, const std::string& newName, IUserPrompt& prompt);
    static std::string RenameClashMessage(const std::string& name);

    // What a file holds: 1 a block project, 0 a recognised sequence file, 3 anything else
    // (including a file that cannot be read).
    enum FileClass { kFileSequences = 0, kFileBlockProject = 1, kFileOther = 3 };
    static int ClassifyFile(const std::string& path);

    // Molecule type, then the molecules as owned pointers.
    void Serialize(CArchive& ar) override;

  private:
    std::vector<std::unique_ptr<CSxMolX>> m_molecules;
    int m_type;
};
