#pragma once
// tiler-blocks-cli: every command of the command-line tool, callable in-process by tests.

#include <CLI/CLI.hpp>

#include <iosfwd>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

// Exit statuses of the tool.
enum CliStatus { kCliDone = 0, kCliSearchFailed = 1, kCliBadInput = 2 };

// A command failed: `what()` goes to stderr and the tool exits with `status`.
class CCliError : public std::runtime_error {
  public:
    CCliError(int status, const std::string& message)
        : std::runtime_error(message), m_status(status) {}
    int Status() const { return m_status; }

  private:
    int m_status;
};

// What a command writes to and reports back.
struct CCliContext {
    CCliContext(std::ostream& out, std::ostream& err, bool errIsTerminal = false)
        : out(out), err(err), errIsTerminal(errIsTerminal) {}

    std::ostream& out;
    std::ostream& err;
    bool errIsTerminal = false;  // progress is shown on stderr only on a terminal
    int status = kCliDone;
    // Objects a command hands back to main, which may end the process without destroying them.
    std::vector<std::shared_ptr<void>> keepAlive;
};

// Each command group adds its subcommands to the application; their callbacks write through
// the context and throw CCliError on failure.
void AddMatrixCommands(CLI::App& app, CCliContext& context);
void AddMoleculeCommands(CLI::App& app, CCliContext& context);
void AddProjectCommands(CLI::App& app, CCliContext& context);
void AddSearchCommand(CLI::App& app, CCliContext& context);

// Parses `args` (without the program name) and runs the command; returns the exit status.
// What the command leaves in `context.keepAlive` lives as long as the context.
int RunCli(const std::vector<std::string>& args, CCliContext& context);

// The same with a context of its own, destroyed before returning.
int RunCli(const std::vector<std::string>& args, std::ostream& out, std::ostream& err,
           bool errIsTerminal = false);
