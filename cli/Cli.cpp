#include "Cli.h"

#include <ostream>

int RunCli(const std::vector<std::string>& args, CCliContext& context) {
    std::ostream& out = context.out;
    std::ostream& err = context.err;
    CLI::App app("Finds conserved ungapped blocks in sets of protein sequences.",
                 "tiler-blocks-cli");
    app.require_subcommand(1);
    AddMatrixCommands(app, context);
    AddMoleculeCommands(app, context);
    AddProjectCommands(app, context);
    AddSearchCommand(app, context);

    std::vector<std::string> reversed(args.rbegin(), args.rend());
    try {
        app.parse(reversed);
    } catch (const CLI::CallForHelp&) {
        out << app.help();
        return kCliDone;
    } catch (const CLI::CallForAllHelp&) {
        out << app.help("", CLI::AppFormatMode::All);
        return kCliDone;
    } catch (const CLI::ParseError& e) {
        // Help for a subcommand arrives as a parse error with exit code 0.
        if (e.get_exit_code() == 0) {
            out << (app.get_subcommands().empty() ? app.help()
                                                  : app.get_subcommands().front()->help());
            return kCliDone;
        }
        err << "tiler-blocks-cli: " << e.what() << "\n";
        return kCliBadInput;
    } catch (const CCliError& e) {
        err << e.what() << "\n";
        return e.Status();
    }
    return context.status;
}

int RunCli(const std::vector<std::string>& args, std::ostream& out, std::ostream& err,
           bool errIsTerminal) {
    CCliContext context{out, err, errIsTerminal};
    return RunCli(args, context);
}
