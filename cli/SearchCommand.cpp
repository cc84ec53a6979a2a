// tiler-blocks-cli search: a block search over every molecule of the given files, printed as
// the block table (or JSON), optionally saved as a project and exported as MSF.

#include <chrono>
#include <cstdarg>
#include <limits>
#include <map>
#include <optional>
#include <ostream>

#include "BlockProject.h"
#include "BlockTable.h"
#include "Cli.h"
#include "SimTool.h"
#include "archive/FileIO.h"

namespace {

const std::map<std::string, int> kRawTypes = {{"protein", kTypeProtein}, {"dna", kTypeNucleic}};

struct CSearchOptions {
    std::vector<std::string> files;
    std::string matrix;
    std::optional<int> cutoff;
    std::optional<int> minSequences;
    std::optional<double> expectationLimit;
    std::string templatePath;
    std::string raw;
    std::string format = "tsv";
    std::string savePath;
    std::string msfPath;
    int threads = 0;
    bool quiet = false;
};

// Messages go to stderr; an unrecognised file is read as --raw says, or refused.
class CSearchPrompt : public IUserPrompt {
  public:
    CSearchPrompt(std::ostream& err, int rawType) : m_err(err), m_rawType(rawType) {}
    void ShowMessage(const std::string& text, MessageIcon) override { m_err << text << "\n"; }
    int AskRawSequenceType(const std::string& path, int presetType) override {
        if (m_rawType == kTypeUnknown || (presetType != kTypeUnknown && presetType != m_rawType)) {
            m_err << "Unrecognized file format: " << path << "\n";
            return kTypeUnknown;
        }
        return m_rawType;
    }

  private:
    std::ostream& m_err;
    int m_rawType;
};

// The engine with its progress on stderr (on a terminal), a few times a second.
class CCliSimTool : public CSimTool {
  public:
    CCliSimTool(CSearchJob& job, std::ostream* progress)
        : CSimTool(job.matrix, job.parameters, job.molecules, &job.result), m_progress(progress) {}

  protected:
    void ReportProgress(const char* format, ...) override {
        if (!m_progress)
            return;
        const auto now = std::chrono::steady_clock::now();
        if (now - m_lastShown < std::chrono::milliseconds(100))
            return;
        m_lastShown = now;
        va_list args;
        va_start(args, format);
        *m_progress << "\r" << FormatText(format, args) << "\x1b[K" << std::flush;
        va_end(args);
    }
    int Finish(int ok) override {
        if (m_progress)
            *m_progress << "\r\x1b[K" << std::flush;
        return ok;
    }
    void ShowMessage(const std::string& message) override {
        // Reaches the user even with --quiet: the search stops because of it.
        if (m_progress)
            *m_progress << "\r\x1b[K";
        m_messages.push_back(message);
    }

  public:
    const std::vector<std::string>& Messages() const { return m_messages; }

  private:
    std::vector<std::string> m_messages;
    std::ostream* m_progress;
    std::chrono::steady_clock::time_point m_lastShown{};
};

// What a search did, for the summary line and the failure message.
struct CSearchOutcome {
    bool complete = false;
    std::size_t hits = 0;
    std::size_t diagonals = 0;
    CSimTool::Failure failure = CSimTool::kNoFailure;
    std::string failedMolecule;
    std::vector<std::string> messages;
};

CScoreMatrix LoadMatrix(const std::string& nameOrPath) {
    CScoreMatrix matrix;
    if (!matrix.LoadBuiltinOrFile(nameOrPath)) {
        throw CCliError(kCliBadInput,
                        "tiler-blocks-cli: matrix \"" + nameOrPath + "\": " + matrix.LastError());
    }
    return matrix;
}

// The parameters: defaults, then the template, then the explicit options.
void ApplyParameters(const CSearchOptions& options, CQuilterParams& params) {
    if (!options.templatePath.empty()) {
        const CQuilterParams::TemplateOutcome outcome =
            params.ReadTemplateFile(options.templatePath);
        if (outcome != CQuilterParams::kTemplateRead) {
            throw CCliError(kCliBadInput,
                            "tiler-blocks-cli: " + CQuilterParams::TemplateOutcomeMessage(
                                                       outcome, options.templatePath));
        }
    }
    if (!options.matrix.empty()) {
        params.SetMatrix(LoadMatrix(options.matrix));
        params.SetCutoffFromMatrix();
    }
    if (options.cutoff)
        params.SetCutoff(*options.cutoff);
    if (options.minSequences)
        params.SetMinSequences(*options.minSequences);
    if (options.expectationLimit)
        params.SetExpectationLimit(*options.expectationLimit);
}

void AddFiles(const CSearchOptions& options, CBlockProject& project, CCliContext& context) {
    CSearchPrompt prompt(context.err,
                         options.raw.empty() ? kTypeUnknown : kRawTypes.at(options.raw));
    for (const std::string& path : options.files) {
        if (!project.AddFile(path, prompt)) {
            throw CCliError(kCliBadInput, "tiler-blocks-cli: no molecules read from " + path);
        }
    }
}

// Searches every molecule of the project; the project holds the result when it completed.
CSearchOutcome SearchAll(CBlockProject& project, const CSearchOptions& options,
                         CCliContext& context) {
    const std::vector<const CSxMolX*> molecules = project.AllMolecules();
    const std::string refusal = CSimTool::TooManyMoleculesMessage(molecules.size());
    if (!refusal.empty())
        throw CCliError(kCliBadInput, "tiler-blocks-cli: " + refusal);

    CSearchOutcome outcome;
    const bool showProgress = context.errIsTerminal && !options.quiet;
    const SearchRunner run = [&](CSearchJob& job) {
        CCliSimTool tool(job, showProgress ? &context.err : nullptr);
        tool.SetThreadCount(options.threads);
        const bool complete = tool.Run() == 1;
        outcome.hits = tool.Hits().size();
        outcome.diagonals = tool.Diagonals().size();
        outcome.failure = tool.LastFailure();
        if (tool.FailedMolecule() >= 0) {
            outcome.failedMolecule = job.molecules[tool.FailedMolecule()].Name();
        }
        outcome.messages = tool.Messages();
        return complete;
    };
    CSearchPrompt prompt(context.err, kTypeUnknown);
    outcome.complete = project.Search(molecules, run, prompt);
    return outcome;
}

std::string FailureText(const CSearchOutcome& outcome, const CBlockProject& project) {
    switch (outcome.failure) {
        case CSimTool::kTooFewMolecules:
            return "a search needs at least 2 molecules";
        case CSimTool::kUnencodableSequence:
            return "molecule \"" + outcome.failedMolecule +
                   "\" holds a residue outside the alphabet of matrix \"" +
                   project.Params().Matrix().Name() + "\"";
        case CSimTool::kLowMemory:
        case CSimTool::kOutOfMemory:
            return "not enough memory for its diagonals and blocks";
        case CSimTool::kTooManyDiagonals:
            return "the molecules match at too many offsets (a higher --cutoff helps)";
        case CSimTool::kTooManyHits:
            return "the pairwise comparisons found more hits than a search can expand (a higher "
                   "--cutoff helps)";
        case CSimTool::kNotEnoughMemory:
            return "the molecules need more memory than the system has";
        default:
            return "the search did not complete";
    }
}

void PrintResult(const CBlockProject& project, const CSearchOutcome& outcome,
                 const CSearchOptions& options, std::ostream& out) {
    const CSimBlockSet& set = project.BlockSet();
    const CQuilterParams& params = project.Params();
    if (options.format == "json") {
        nlohmann::json molecules = nlohmann::json::array();
        for (const auto& entry : set.Molecules().items) {
            molecules.push_back({{"name", entry->Name()}, {"length", entry->Sequence().size()}});
        }
        const nlohmann::json rest = {{"parameters",
                                      {{"matrix", params.Matrix().Name()},
                                       {"cutoff", params.Cutoff()},
                                       {"min_seqs", params.MinSequences()},
                                       {"evalue", params.ExpectationLimit()}}},
                                     {"molecules", molecules},
                                     {"hits", outcome.hits},
                                     {"diagonals", outcome.diagonals}};
        // Keys are written in sorted order, "blocks" first; the blocks are streamed.
        out << "{\n  \"blocks\": ";
        WriteBlocksJson(out, set, params.Matrix(), params.ExpectationLimit(), 1);
        out << "," << rest.dump(2).substr(1) << "\n";
        return;
    }
    WriteBlockTable(out, set, params.Matrix(), params.ExpectationLimit());
}

void WriteOutputs(const CBlockProject& project, const CSearchOptions& options) {
    try {
        if (!options.savePath.empty())
            project.Save(options.savePath);
        if (!options.msfPath.empty()) {
            CMsfExport msf = project.BuildMsf();
            if (!msf.IsWritable()) {
                throw CCliError(kCliSearchFailed,
                                "tiler-blocks-cli: no aligned molecules to write as MSF");
            }
            msf.Save(options.msfPath);
        }
    } catch (const CFileException& e) {
        throw CCliError(kCliBadInput, std::string("tiler-blocks-cli: ") + e.what());
    }
}

void RunSearch(const CSearchOptions& options, CCliContext& context) {
    // The defaults: the user's own template is read only when named.
    const auto owner = std::make_shared<CBlockProject>();
    CBlockProject& project = *owner;
    ApplyParameters(options, project.Params());
    AddFiles(options, project, context);
    const CSearchOutcome outcome = SearchAll(project, options, context);
    for (const std::string& message : outcome.messages)
        context.err << message << "\n";
    if (!outcome.complete) {
        throw CCliError(kCliSearchFailed,
                        "tiler-blocks-cli: search failed: " + FailureText(outcome, project));
    }
    PrintResult(project, outcome, options, context.out);
    WriteOutputs(project, options);
    if (!options.quiet) {
        context.err << "hits: " << outcome.hits << "  diagonals: " << outcome.diagonals
                    << "  blocks: " << project.BlockSet().BlockCount() << "\n";
    }
    // Main may end the process without taking the many blocks apart one by one.
    context.keepAlive.push_back(owner);
}

}  // namespace

void AddSearchCommand(CLI::App& app, CCliContext& context) {
    auto options = std::make_shared<CSearchOptions>();
    CLI::App* search =
        app.add_subcommand("search", "A block search over all molecules of the files");
    search->add_option("FILE", options->files, "Sequence files")
        ->required()
        ->check(CLI::ExistingFile);
    search->add_option("--matrix", options->matrix,
                       "Built-in matrix name or matrix file (default blosum62mt)");
    search->add_option("--cutoff", options->cutoff, "Pairwise score cutoff (default: the matrix's)")
        ->check(CLI::Range(1, std::numeric_limits<int>::max()));
    search
        ->add_option("--min-seqs", options->minSequences, "Minimum sequences per block (default 5)")
        ->check(CLI::Range(2, std::numeric_limits<int>::max()));
    search
        ->add_option("--evalue", options->expectationLimit,
                     "Expectation value limit (default 0.0001)")
        ->check(CLI::Validator(
            [](const std::string& text) -> std::string {
                double limit = 0;
                return CLI::detail::lexical_cast(text, limit) &&
                               CQuilterParams::IsValidExpectationLimit(limit)
                           ? ""
                           : "an expectation value limit is a positive number, not " + text;
            },
            "POSITIVE"));
    search->add_option("--template", options->templatePath, "Parameters from a template (.bp1)")
        ->check(CLI::ExistingFile);
    search->add_option("--raw", options->raw, "How to read unrecognised files")
        ->check(CLI::IsMember({"protein", "dna"}));
    search->add_option("--format", options->format, "Output format")
        ->check(CLI::IsMember({"tsv", "json"}));
    search->add_option("--save", options->savePath, "Save the result as a project (.bpr)");
    search->add_option("--msf", options->msfPath, "Write the alignment as MSF");
    search->add_option("--threads", options->threads, "Worker threads (default: every core)")
        ->check(CLI::Range(1, 1024));
    search->add_flag("--quiet", options->quiet, "No progress and no summary line on stderr");
    search->callback([options, &context] { RunSearch(*options, context); });
}
