#pragma once
// Runs tiler-blocks-cli in-process and keeps what it printed.

#include <sstream>
#include <string>
#include <vector>

#include "Cli.h"

struct CRun {
    int status;
    std::string out;
    std::string err;
};

inline CRun RunTool(const std::vector<std::string>& args) {
    std::ostringstream out;
    std::ostringstream err;
    const int status = RunCli(args, out, err);
    return {status, out.str(), err.str()};
}
