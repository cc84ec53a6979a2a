#include "molecule/MolList.h"

#include <algorithm>
#include <filesystem>

#include "archive/FileIO.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"
#include "import/UniqueNamer.h"
#include "import/UrlCompanion.h"
#include "molecule/MolListException.h"

namespace {

std::string WrongTypeMessage(int fileType) {
    bool nucleic = fileType == kTypeNucleic;
    return std::string("You cannot add ") + (nucleic ? "a nucleic" : "an amino") +
           " acid sequence to " + (nucleic ? "an amino" : "a nucleic") + " acid project.";
}

// Binary data (a NUL byte) is no sequence file of any format, raw sequence included.
bool HoldsBinaryData(CSxStream& stream) {
    bool binary = false;
    for (std::string line; !binary && stream.ReadLine(line);)
        binary = line.find('\0') != std::string::npos;
    stream.Rewind();
    return binary;
}

// The file's contents; a file that cannot be read at all throws, naming the file and why.
CSxStream OpenForImport(const std::string& path) {
    std::error_code error;
    if (std::filesystem::is_directory(path, error))
        throw CMolListException(kImportUnreadable, path + ": is a folder, not a file");
    try {
        CSxStream stream = CSxStream::FromFile(path);
        if (HoldsBinaryData(stream))
            throw CMolListException(kImportUnreadable, path + ": not a sequence file");
        return stream;
    } catch (const CFileException& e) {
        throw CMolListException(kImportUnreadable, e.what());
    }
}

}  // namespace

CMolList::CMolList(const CMolList& other) : CSerializable(other), m_type(other.m_type) {
    for (const auto& molecule : other.m_molecules) {
        m_molecules.push_back(std::make_unique<CSxMolX>(*molecule));
    }
}

bool CMolList::AddFile(const std::string& path, IUserPrompt& prompt) {
    CSxStream stream = OpenForImport(path);
    CRecognition recognition = Recognise(stream);
    if (recognition.type != kTypeUnknown && m_type != kTypeUnknown && recognition.type != m_type) {
        prompt.ShowMessage(WrongTypeMessage(recognition.type), MessageIcon::exclamation);
        return false;
    }
    int format = recognition.format;
    if (recognition.type != kTypeUnknown && format != kFormatUnknown) {
        if (m_type == kTypeUnknown)
            m_type = recognition.type;
    } else {
        int answer = prompt.AskRawSequenceType(path, m_type);
        if (answer != kTypeNucleic && answer != kTypeProtein)
            return false;
        m_type = answer;
        format = kFormatRaw;
    }

    stream.Rewind();
    std::vector<std::string> names;
    for (const auto& molecule : m_molecules)
        names.push_back(molecule->Name());
    CUniqueNamer namer(names);
    CUrlCompanion companion(path);
    CSkippedRecords skipped(FileNameOf(path));
    int added = 0;
    // Records are counted for the companion's URLs whether they are read or skipped.
    for (int index = 0;; ++index) {
        auto molecule = std::make_unique<CSxMolX>(m_type);
        int result = ReadMolecule(format, *molecule, stream);
        if (IsEndOfRecords(result))
            break;
        if (result != kReadOne) {
            skipped.Add(result, stream.RecordLine(), stream.ProblemLine());
            continue;
        }
        std::string base = BaseNameOf(path);
        if (format == kFormatRaw && !base.empty())
            molecule->SetName(base);
        molecule->SetName(namer.Take(molecule->Name()));
        molecule->SetSourceUrl(companion.UrlOf(index));
        if (molecule->Creator().name.empty())
            molecule->Creator().name = "UNKNOWN";
        if (molecule->Modifier().name.empty())
            molecule->Modifier() = molecule->Creator();
        m_molecules.push_back(std::move(molecule));
        ++added;
    }
    if (const std::string message = skipped.Message(added); !message.empty())
        prompt.ShowMessage(message, MessageIcon::exclamation);
    return added > 0;
}

CSxMolX* CMolList::At(int index) const {
    if (index < 0 || index >= Count())
        return nullptr;
    return m_molecules[static_cast<std::size_t>(index)].get();
}

CSxMolX* CMolList::FindByName(const std::string& name) const {
    return At(IndexOfName(name));
}

CSxMolX* CMolList::FindByKey(const std::string& key) const {
    auto found = std::find_if(m_molecules.begin(), m_molecules.end(),
                              [&](const auto& molecule) { return molecule->Key() == key; });
    return found == m_molecules.end() ? nullptr : found->get();
}

int CMolList::IndexOfName(const std::string& name) const {
    auto found = std::find_if(m_molecules.begin(), m_molecules.end(),
                              [&](const auto& molecule) { return molecule->Name() == name; });
    return found == m_molecules.end() ? -1 : static_cast<int>(found - m_molecules.begin());
}

void CMolList::DeleteByName(const std::string& name) {
    int index = IndexOfName(name);
    if (index >= 0)
        m_molecules.erase(m_molecules.begin() + index);
}

void CMolList::Append(std::unique_ptr<CSxMolX> molecule) {
    m_molecules.push_back(std::move(molecule));
}

std::string CMolList::RenameClashMessage(const std::string& name) {
    return "Illegal name. Molecule with the name \"" + name + "\" already exists in the project.";
}

bool CMolList::Rename(const std::string& oldName, const std::string& newName, IUserPrompt& prompt) {
    CSxMolX* molecule = FindByName(oldName);
    if (!molecule)
        return false;
    if (newName != oldName && FindByName(newName)) {
        prompt.ShowMessage(RenameClashMessage(newName), MessageIcon::exclamation);
        return false;
    }
    molecule->SetName(newName);
    return true;
}

int CMolList::ClassifyFile(const std::string& path) {
    CSxStream stream("");
    try {
        std::vector<std::uint8_t> bytes = ReadWholeFile(path, kMaxSequenceFileBytes);
        if (CArchive::LeadingString(bytes) == "BlockProject")
            return kFileBlockProject;
        stream = CSxStream(std::string(bytes.begin(), bytes.end()));
    } catch (const CFileException&) {
        return kFileOther;
    }
    switch (Recognise(stream).format) {
        case kFormatGenBank:
        case kFormatEmbl:
        case kFormatFasta:
        case kFormatSuite:
            return kFileSequences;
        default:
            return kFileOther;
    }
}

void CMolList::Serialize(CArchive& ar) {
    std::int32_t type = m_type;
    ar.XMember(type);
    m_type = type;
    if (ar.IsStoring()) {
        ar.XObjectList(m_molecules);
        return;
    }
    // Molecule records of another class than CSxMolX are taken over as CSxMolX copies.
    m_molecules.clear();
    std::size_t count = 0;
    ar.XCount(count, 1);
    for (std::size_t i = 0; i < count; ++i) {
        std::unique_ptr<CSxMol> element;
        ar.XPointer(element);
        if (!element)
            continue;
        if (auto* molecule = dynamic_cast<CSxMolX*>(element.get())) {
            element.release();
            m_molecules.emplace_back(molecule);
        } else {
            m_molecules.push_back(std::make_unique<CSxMolX>(*element));
        }
    }
}

TB_REGISTER_CLASS(CMolList);
