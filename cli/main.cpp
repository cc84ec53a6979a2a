#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <iostream>

#include "Cli.h"

int main(int argc, char** argv) {
    std::ios::sync_with_stdio(false);
    const std::vector<std::string> args(argv + 1, argv + argc);
    CCliContext context{std::cout, std::cerr, ::isatty(STDERR_FILENO) != 0};
    const int status = RunCli(args, context);
    std::cout.flush();
    std::cerr.flush();
    std::fflush(nullptr);
    // Ends without destructors: the context may hold a search's hundreds of thousands of small
    // allocations, which the system reclaims at once but freeing one by one would take a while.
    std::_Exit(status);
}
