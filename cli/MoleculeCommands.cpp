// tiler-blocks-cli import|export: sequence files read into a molecule list, and molecules
// written by the export writers.

#include <map>
#include <memory>
#include <ostream>

#include "Cli.h"
#include "UserPrompt.h"
#include "archive/FileIO.h"
#include "export/SequenceWriters.h"
#include "molecule/MolList.h"
#include "molecule/MolListException.h"

namespace {

const std::map<std::string, int> kRawTypes = {{"protein", kTypeProtein}, {"dna", kTypeNucleic}};
const std::map<std::string, int> kFormats = {{"genpept", kExportFlatFile},
                                             {"swissprot", kExportSwissEmbl},
                                             {"fasta", kExportFasta},
                                             {"raw", kExportRaw}};

// Messages go to stderr; the raw-sequence question is answered by --raw.
class CCliPrompt : public IUserPrompt {
  public:
    CCliPrompt(std::ostream& err, int rawType) : m_err(err), m_rawType(rawType) {}

    void ShowMessage(const std::string& text, MessageIcon) override { m_err << text << "\n"; }

    int AskRawSequenceType(const std::string& path, int presetType) override {
        if (m_rawType == kTypeUnknown) {
            m_err << "Unrecognized file format: " << path << "\n";
            return kTypeUnknown;
        }
        if (presetType != kTypeUnknown && presetType != m_rawType) {
            m_err << "Unrecognized file format: " << path << "\n"
                  << "--raw names the other molecule type than the molecule list holds.\n";
            return kTypeUnknown;
        }
        return m_rawType;
    }

  private:
    std::ostream& m_err;
    int m_rawType;
};

struct CMoleculeOptions {
    std::vector<std::string> files;
    std::string raw;
    std::string format;
    std::string output;
};

int RawTypeOf(const CMoleculeOptions& options) {
    return options.raw.empty() ? kTypeUnknown : kRawTypes.at(options.raw);
}

// Adds every file to the list; false when any file was refused or could not be read.
bool AddFiles(CMolList& list, const CMoleculeOptions& options, CCliContext& context) {
    CCliPrompt prompt(context.err, RawTypeOf(options));
    bool allAdded = true;
    for (const std::string& path : options.files) {
        try {
            allAdded = list.AddFile(path, prompt) && allAdded;
        } catch (const CMolListException& e) {
            context.err << "tiler-blocks-cli: cannot read " << e.what() << "\n";
            allAdded = false;
        }
    }
    return allAdded;
}

void RunImport(const CMoleculeOptions& options, CCliContext& context) {
    CMolList list(kTypeProtein);  // the list of a new project
    bool allAdded = AddFiles(list, options, context);
    for (int i = 0; i < list.Count(); ++i) {
        context.out << list.At(i)->Name() << "\t" << list.At(i)->SequenceLength() << "\n";
    }
    if (!allAdded)
        context.status = kCliBadInput;
}

void RunExport(const CMoleculeOptions& options, CCliContext& context) {
    CMolList list;  // the first file decides the molecule type
    if (!AddFiles(list, options, context)) {
        throw CCliError(kCliBadInput, "tiler-blocks-cli: nothing written to " + options.output);
    }
    std::vector<const CSxMol*> molecules;
    for (int i = 0; i < list.Count(); ++i)
        molecules.push_back(list.At(i));
    try {
        WriteFileAtomically(options.output,
                            ExportMolecules(molecules, kFormats.at(options.format)));
    } catch (const CFileException& e) {
        throw CCliError(kCliBadInput, std::string("tiler-blocks-cli: ") + e.what());
    }
}

void AddRawOption(CLI::App* command, CMoleculeOptions& options) {
    command->add_option("--raw", options.raw, "How to read unrecognised files: protein or dna")
        ->check(CLI::IsMember({"protein", "dna"}));
}

}  // namespace

void AddMoleculeCommands(CLI::App& app, CCliContext& context) {
    auto importOptions = std::make_shared<CMoleculeOptions>();
    CLI::App* import = app.add_subcommand(
        "import", "Reads sequence files into a new project: NAME<TAB>LENGTH per molecule");
    AddRawOption(import, *importOptions);
    import->add_option("FILE", importOptions->files, "Sequence files")->required();
    import->callback([importOptions, &context] { RunImport(*importOptions, context);
});

auto exportOptions = std::make_shared<CMoleculeOptions>();
CLI::App* exporter =
    app.add_subcommand("export", "Writes every molecule of the files in one sequence format");
exporter->add_option("--format", exportOptions->format, "genpept, swissprot, fasta or raw")
    ->required()
    ->check(CLI::IsMember({"genpept", "swissprot", "fasta", "raw"}));
AddRawOption(exporter, *exportOptions);
exporter->add_option("-o", exportOptions->output, "Output file")->required();
exporter->add_option("FILE", exportOptions->files, "Sequence files")->required();
exporter->callback([exportOptions, &context] { RunExport(*exportOptions, context); });
}
