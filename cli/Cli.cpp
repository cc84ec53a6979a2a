#include "Cli.h"

#include <ostream>
#include <string_view>

namespace {

constexpr std::string_view kPrefix = "tiler-blocks-cli: ";

// Every error line of the tool starts with its name, whichever command raised it.
std::string Prefixed(const std::string& message) {
    return message.rfind(kPrefix, 0) == 0 ? message : std::string(kPrefix) + message;
}

// The command a parse error belongs to, for the hint that ends a usage error.
std::string CommandPath(const CLI::App& app) {
    std::string path;
    for (const CLI::App* command = &app; !command->get_subcommands().empty();) {
        command = command->get_subcommands().front();
        path += command->get_name() + " ";
    }
    return path;
}

bool IsCommand(const CLI::App& app, const std::string& name) {
    try {
        return app.get_subcommand(name) != nullptr;
    } catch (const CLI::OptionNotFound&) {
        return false;
    }
}

}  // namespace

int RunCli(const std::vector<std::string>& args, CCliContext& context) {
    std::ostream& out = context.out;
    std::ostream& err = context.err;
    CLI::App app("Finds conserved ungapped blocks in sets of protein sequences.",
                 "tiler-blocks-cli");
    app.require_subcommand(1);
    app.set_version_flag("--version", "tiler-blocks-cli " TB_VERSION);
    AddMatrixCommands(app, context);
    AddMoleculeCommands(app, context);
    AddProjectCommands(app, context);
    AddSearchCommand(app, context);

    if (!args.empty() && !args.front().starts_with('-') && !IsCommand(app, args.front())) {
        err << kPrefix << "unknown command '" << args.front()
            << "'\nRun 'tiler-blocks-cli --help' for usage.\n";
        return kCliBadInput;
    }
    std::vector<std::string> reversed(args.rbegin(), args.rend());
    try {
        app.parse(reversed);
    } catch (const CLI::CallForHelp&) {
        out << app.help();
        return kCliDone;
    } catch (const CLI::CallForAllHelp&) {
        out << app.help("", CLI::AppFormatMode::All);
        return kCliDone;
    } catch (const CLI::CallForVersion& e) {
        out << e.what() << "\n";
        return kCliDone;
    } catch (const CLI::ParseError& e) {
        // Help for a subcommand arrives as a parse error with exit code 0.
        if (e.get_exit_code() == 0) {
            out << (app.get_subcommands().empty() ? app.help()
                                                  : app.get_subcommands().front()->help());
            return kCliDone;
        }
        err << Prefixed(e.what()) << "\nRun 'tiler-blocks-cli " << CommandPath(app)
            << "--help' for usage.\n";
        return kCliBadInput;
    } catch (const CCliError& e) {
        err << Prefixed(e.what()) << "\n";
        return e.Status();
    }
    return context.status;
}

int RunCli(const std::vector<std::string>& args, std::ostream& out, std::ostream& err,
           bool errIsTerminal) {
    CCliContext context{out, err, errIsTerminal};
    return RunCli(args, context);
}
