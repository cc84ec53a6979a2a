// The options of tiler-blocks-cli search, as a user might type them, over a small fixed set of
// sequences: any arguments must end in status 0, 1 or 2 with a reason on stderr for a failure,
// never in a crash. The input is one argument a line. Arguments that name paths elsewhere or
// save files are left out, and so are thread counts above 4, so that a run reads no file
// outside its folder, writes none and stays quick.
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

#include "Cli.h"

namespace {

// Three short related proteins, written once into the temporary folder.
const std::string& SequenceFile() {
    static const std::string path = [] {
        const std::filesystem::path file =
            std::filesystem::temp_directory_path() / "tb-fuzz-search-options.fa";
        std::ofstream(file) << ">a\nMKVLAAGIVGLLLAWQPSHAEEKTCWLGDR\n"
                               ">b\nMKILAAGLVGLLLSWQPSHADEKTCWIGDR\n"
                               ">c\nMRVLSAGIVALLLAWEPSHAEQKTCWLGER\n";
        return file.string();
    }();
    return path;
}

bool StartsWith(std::string_view text, std::string_view prefix) {
    return text.substr(0, prefix.size()) == prefix;
}

bool WritesFiles(std::string_view argument) {
    return StartsWith(argument, "--save") || StartsWith(argument, "--msf");
}

// "--threads 9" and "--threads=9": more threads than a fuzzing run should start.
bool ManyThreads(std::string_view value) {
    return value.size() > 1 || (!value.empty() && value[0] > '4');
}

std::vector<std::string> SafeArguments(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line) && lines.size() < 16;)
        lines.push_back(line);
    std::vector<std::string> arguments = {"search"};
    for (std::size_t i = 0; i < lines.size(); ++i) {
        const std::string& argument = lines[i];
        const bool takesNext = i + 1 < lines.size();
        if (argument.find('/') != std::string::npos)
            continue;
        if (WritesFiles(argument)) {
            i += argument.find('=') == std::string::npos && takesNext;  // and its value
            continue;
        }
        if (argument == "--threads" && takesNext && ManyThreads(lines[i + 1])) {
            ++i;
            continue;
        }
        if (StartsWith(argument, "--threads=") && ManyThreads(argument.substr(10)))
            continue;
        arguments.push_back(argument);
    }
    arguments.push_back(SequenceFile());
    return arguments;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::vector<std::string> arguments =
        SafeArguments(std::string(reinterpret_cast<const char*>(data), size));
    std::ostringstream out;
    std::ostringstream err;
    const int status = RunCli(arguments, out, err);
    if (status < 0 || status > 2 || (status != 0 && err.str().empty()))
        std::abort();
    return 0;
}
