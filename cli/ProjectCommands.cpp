// tiler-blocks-cli info|msf|link|unlink|define-block: reading a saved project, exporting its
// alignment, and the alignment pane's link, unlink and define-block operations on a selection
// given as --rows NAME:FIRST-LAST (1-based residue positions, inclusive, as the block table
// prints them) or --columns NAME:FIRST-LAST (1-based display columns).

#include <cstdio>
#include <memory>
#include <optional>
#include <ostream>

#include "BlockProject.h"
#include "BlockTable.h"
#include "Cli.h"
#include "archive/FileIO.h"

namespace {

std::string Printf(const char* format, double value) {
    char text[64];
    std::snprintf(text, sizeof text, format, value);
    return text;
}

std::unique_ptr<CBlockProject> LoadProject(const std::string& path) {
    std::unique_ptr<CBlockProject> project;
    try {
        project = CBlockProject::Load(path);
    } catch (const CFileException& e) {
        throw CCliError(kCliBadInput, e.what());
    } catch (const CArchiveException& e) {
        // The program's message and, beyond it, which part of the file is damaged.
        throw CCliError(kCliBadInput, path + "\n" + e.what());
    }
    if (!project)
        throw CCliError(kCliBadInput, path + " is not a block project");
    return project;
}

void SaveProject(const CBlockProject& project, const std::string& path) {
    try {
        project.Save(path);
    } catch (const CFileException& e) {
        throw CCliError(kCliBadInput, e.what());
    }
}

// One row of the block table, as the search command prints it.
std::string BlockTableLine(const CBlockProject& project, int index) {
    return BlockTableRow(project.BlockSet(), index, project.Params().Matrix(),
                         project.Params().ExpectationLimit());
}

void PrintInfo(const CBlockProject& project, std::ostream& out) {
    const CQuilterParams& params = project.Params();
    out << "# parameters\n"
        << "matrix\t" << params.Matrix().Name() << "\n"
        << "cutoff\t" << params.Cutoff() << "\n"
        << "min-seqs\t" << params.MinSequences() << "\n"
        << "evalue\t" << Printf("%g", params.ExpectationLimit()) << "\n";
    out << "# molecules\n";
    for (int i = 0; i < project.MoleculeCount(); ++i) {
        out << project.MoleculeAt(i)->Name() << "\t" << project.MoleculeAt(i)->SequenceLength()
            << "\n";
    }
    out << "# blocks\n" << kBlockTableHeader << "\n";
    for (int b = 0; b < project.BlockSet().BlockCount(); ++b) {
        out << BlockTableLine(project, b) << "\n";
    }
    // Each link: its first display column and, per molecule, the residues it holds (1-based).
    out << "# links\n";
    for (const auto& link : project.Links()) {
        out << link->Column() + 1 << "\t";
        for (int k = 0; k < link->MoleculeCount(); ++k) {
            const CSxMolEntry* entry = project.BlockSet().MoleculeAt(link->Molecule(k));
            out << (k ? "," : "") << (entry ? entry->Name() : "?") << ":" << link->Position(k) + 1
                << "-" << link->Position(k) + link->Length(k);
        }
        out << "\n";
    }
}

void ExportMsf(const CBlockProject& project, const std::string& path) {
    CMsfExport msf = project.BuildMsf();
    if (!msf.IsWritable()) {
        throw CCliError(kCliBadInput, "the project has no aligned molecules");
    }
    try {
        msf.Save(path);
    } catch (const CFileException& e) {
        throw CCliError(kCliBadInput, MsfWriteErrorMessage(path) + "\n" + e.Reason());
    }
}

// What a selected row names: a molecule and a 1-based inclusive range, in either order.
struct CRowRange {
    std::string name;
    int first = 0;
    int last = 0;
};

std::string UsageHint(const std::string& command) {
    return "\nRun 'tiler-blocks-cli " + command + " --help' for usage.";
}

// "NAME:FIRST-LAST"; the name may itself hold colons, the numbers start at 1.
CRowRange ParseRowRange(const std::string& text, const std::string& command,
                        const std::string& option) {
    const std::size_t colon = text.rfind(':');
    const std::size_t dash = colon == std::string::npos ? colon : text.find('-', colon);
    int first = 0;
    int last = 0;
    std::size_t used = 0;
    try {
        if (dash == std::string::npos)
            throw std::invalid_argument(text);
        first = std::stoi(text.substr(colon + 1, dash - colon - 1), &used);
        if (used != dash - colon - 1)
            throw std::invalid_argument(text);
        last = std::stoi(text.substr(dash + 1), &used);
        if (used != text.size() - dash - 1)
            throw std::invalid_argument(text);
    } catch (const std::exception&) {
        throw CCliError(kCliBadInput,
                        option + " wants NAME:FIRST-LAST, not '" + text + "'" + UsageHint(command));
    }
    if (first < 1 || last < 1) {
        throw CCliError(kCliBadInput, option + " counts from 1, not from 0, in '" + text + "'" +
                                          UsageHint(command));
    }
    return {text.substr(0, colon), first, last};
}

void RequireRow(const CAlignmentLayout& layout, const CRowRange& range) {
    if (layout.IndexOfRow(range.name) < 0)
        throw CCliError(kCliBadInput, "the project has no molecule named '" + range.name + "'");
}

// Residue positions as the display columns they stand in today.
ALN_BSEL_ENTRY ResidueRowEntry(const CAlignmentLayout& layout, const CRowRange& range) {
    RequireRow(layout, range);
    std::optional<ALN_BSEL_ENTRY> entry =
        ResidueSelection(layout, range.name, range.first - 1, range.last - 1);
    if (!entry) {
        const int length = layout.RowAt(layout.IndexOfRow(range.name)).segments.SequenceLength();
        throw CCliError(kCliBadInput, "residues " + std::to_string(range.first) + "-" +
                                          std::to_string(range.last) + " lie outside " +
                                          range.name + ", which has " + std::to_string(length) +
                                          " residues");
    }
    return *entry;
}

ALN_BSEL_ENTRY ColumnRowEntry(const CAlignmentLayout& layout, const CRowRange& range) {
    RequireRow(layout, range);
    return {range.name, std::min(range.first, range.last) - 1, std::max(range.first, range.last)};
}

struct CSelectionOptions {
    std::string command;
    std::string project;
    std::vector<std::string> rows;     // residue positions
    std::vector<std::string> columns;  // display columns
    std::string output;
};

std::vector<ALN_BSEL_ENTRY> SelectionOf(const CSelectionOptions& options,
                                        const CAlignmentLayout& layout) {
    std::vector<ALN_BSEL_ENTRY> selection;
    for (const std::string& row : options.rows)
        selection.push_back(ResidueRowEntry(layout, ParseRowRange(row, options.command, "--rows")));
    for (const std::string& row : options.columns)
        selection.push_back(
            ColumnRowEntry(layout, ParseRowRange(row, options.command, "--columns")));
    // As in the alignment pane, a selection stops at gaps.
    return TrimSelection(layout, selection);
}

// Each linked stretch as the residues --rows takes, then the display columns it now holds.
void PrintLinkedStretches(const CBlockProject& project, const std::vector<ALN_BSEL_ENTRY>& columns,
                          std::ostream& out) {
    const CAlignmentLayout layout = project.Layout();
    for (const ALN_BSEL_ENTRY& entry : columns) {
        const CSegmentRow& segments = layout.RowAt(layout.IndexOfRow(entry.name)).segments;
        const int first = segments.ColumnToPosition(entry.start);
        const int residues = segments.ResiduesInColumns(entry.start, entry.end);
        out << entry.name << ":" << first + 1 << "-" << first + residues << "\t" << entry.start + 1
            << "-" << entry.end << "\n";
    }
}

enum class SelectionOperation { link, unlink, defineBlock };

// Messages of the project's operations go to stderr as errors of the tool.
class CProjectPrompt : public IUserPrompt {
  public:
    explicit CProjectPrompt(std::ostream& err) : m_err(err) {}
    void ShowMessage(const std::string& text, MessageIcon) override {
        m_err << "tiler-blocks-cli: " << text << "\n";
    }
    int AskRawSequenceType(const std::string&, int) override { return kTypeUnknown; }

  private:
    std::ostream& m_err;
};

void RunSelectionOperation(SelectionOperation operation, const CSelectionOptions& options,
                           CCliContext& context) {
    if (options.rows.empty() && options.columns.empty()) {
        throw CCliError(kCliBadInput,
                        "--rows or --columns names the selection" + UsageHint(options.command));
    }
    std::unique_ptr<CBlockProject> project = LoadProject(options.project);
    const std::vector<ALN_BSEL_ENTRY> selection = SelectionOf(options, project->Layout());
    CProjectPrompt prompt(context.err);
    switch (operation) {
        case SelectionOperation::link: {
            std::vector<ALN_BSEL_ENTRY> columns;
            if (!project->Link(selection, prompt, &columns)) {
                throw CCliError(kCliBadInput, "nothing linked");
            }
            PrintLinkedStretches(*project, columns, context.out);
            break;
        }
        case SelectionOperation::unlink:
            if (!project->Unlink(selection)) {
                throw CCliError(kCliBadInput, "nothing was linked there");
            }
            break;
        case SelectionOperation::defineBlock: {
            const CSimBlock* block = project->DefineBlock(selection);
            if (!block) {
                throw CCliError(kCliBadInput, "the selection does not make a block");
            }
            context.out << BlockTableLine(*project, project->BlockSet().IndexOfBlock(*block))
                        << "\n";
            break;
        }
    }
    SaveProject(*project, options.output.empty() ? options.project : options.output);
}

void AddSelectionCommand(CLI::App& app, CCliContext& context, const std::string& name,
                         const std::string& description, SelectionOperation operation) {
    auto options = std::make_shared<CSelectionOptions>();
    options->command = name;
    CLI::App* command = app.add_subcommand(name, description);
    command->add_option("PROJECT", options->project, "Block project (.bpr)")->required();
    command
        ->add_option("--rows", options->rows,
                     "Selected residues as NAME:FIRST-LAST,... (1-based, inclusive, as the block "
                     "table prints them)")
        ->delimiter(',');
    command
        ->add_option("--columns", options->columns,
                     "Selected display columns as NAME:FIRST-LAST,... (1-based, inclusive)")
        ->delimiter(',');
    command->add_option("-o", options->output, "Write the changed project here instead");
    command->callback(
        [options, operation, &context] { RunSelectionOperation(operation, *options, context); });
}

}  // namespace

void AddProjectCommands(CLI::App& app, CCliContext& context) {
    auto infoPath = std::make_shared<std::string>();
    CLI::App* info =
        app.add_subcommand("info", "Parameters, molecules, block table and links of a project");
    info->add_option("PROJECT", *infoPath, "Block project (.bpr)")->required();
    info->callback([infoPath, &context] { PrintInfo(*LoadProject(*infoPath), context.out); });

    auto msfPaths = std::make_shared<std::pair<std::string, std::string>>();
    CLI::App* msf = app.add_subcommand("msf", "Writes the project's linked alignment as MSF");
    msf->add_option("PROJECT", msfPaths->first, "Block project (.bpr)")->required();
    msf->add_option("OUT", msfPaths->second, "MSF file to write")->required();
    msf->callback([msfPaths] { ExportMsf(*LoadProject(msfPaths->first), msfPaths->second); });

    AddSelectionCommand(app, context, "link", "Links the selected columns of the rows",
                        SelectionOperation::link);
    AddSelectionCommand(app, context, "unlink", "Unlinks the selected columns of the rows",
                        SelectionOperation::unlink);
    AddSelectionCommand(app, context, "define-block", "Defines a block on the selected rows",
                        SelectionOperation::defineBlock);
}
