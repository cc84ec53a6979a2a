#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <iostream>

#include "Cli.h"

int main(int argc, char** argv) {
    std::ios::sync_with_stdio(false);
    const std::vector<std::string> args(argv + 1, argv + argc);
    CCliContext context{std::cout, std::cerr, ::isatty(STDERR_FILENO) != 0};
    int status = RunCli(args, context);
    std::cout.flush();
    if (!std::cout && status == kCliDone) {
        // A full disk or a closed pipe lost part of the output: the command did not do its job.
        std::cerr << "tiler-blocks-cli: cannot write the output\n";
        status = kCliBadInput;
    }
    std::cerr.flush();
    std::fflush(nullptr);
    // Ends without destructors: the context may hold a search's hundreds of thousands of small
    // allocations, which the system reclaims at once but freeing one by one would take a while.
    std::_Exit(status);
}
