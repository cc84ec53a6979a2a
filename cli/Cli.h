#pragma once
// tiler-blocks-cli: every command of the command-line tool, callable in-process by tests.

#include <CLI/CLI.hpp>

#include <iosfwd>
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
    std::ostream& out;
    std::ostream& err;
    bool errIsTerminal = false;  // progress is shown on stderr only on a terminal
    int status = kCliDone;
};

// Each command group adds its subcommands to the application; their callbacks write through
// the context and throw CCliError on failure.
void AddMatrixCommands(CLI::App& app, CCliContext& context);
void AddMoleculeCommands(CLI::App& app, CCliContext& context);
void AddProjectCommands(CLI::App& app, CCliContext& context);
void AddSearchCommand(CLI::App& app, CCliContext& context);

// Parses `args` (without the program name) and runs the command; returns the exit status.
int RunCli(const std::vector<std::string>& args, std::ostream& out, std::ostream& err,
           bool errIsTerminal = false);
