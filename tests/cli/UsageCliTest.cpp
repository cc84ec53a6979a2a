// What the tool says about itself and about calls it cannot understand.

#include <gtest/gtest.h>

#include "cli/CliRun.h"

namespace {

const std::string kFasta = TB_TEST_DATA_DIR "/projects/myoglobins6.fa";

TEST(UsageCli, VersionIsTheProjectVersion) {
    const CRun run = RunTool({"--version"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "tiler-blocks-cli " TB_EXPECTED_VERSION "\n");
    EXPECT_EQ(run.err, "");
}

// Every usage error names what was wrong, starts with the tool's name and ends with where to
// read more: the failing command's own help where there is one.
TEST(UsageCli, UsageErrorsPointToTheRightHelp) {
    const struct {
        std::vector<std::string> args;
        std::string what;
        std::string help;
    } cases[] = {
        {{}, "A subcommand is required", "tiler-blocks-cli --help"},
        {{"frobnicate"}, "unknown command 'frobnicate'", "tiler-blocks-cli --help"},
        {{"search", "--cutoff", "many", kFasta}, "--cutoff", "tiler-blocks-cli search --help"},
        {{"matrix", "show"}, "", "tiler-blocks-cli matrix show --help"},
        {{"info"}, "PROJECT", "tiler-blocks-cli info --help"},
        {{"link", "p.bpr", "--rows"}, "--rows", "tiler-blocks-cli link --help"},
    };
    for (const auto& c : cases) {
        const CRun run = RunTool(c.args);
        EXPECT_EQ(run.status, 2) << run.err;
        EXPECT_EQ(run.err.rfind("tiler-blocks-cli: ", 0), 0u) << run.err;
        EXPECT_NE(run.err.find(c.what), std::string::npos) << run.err;
        const std::string hint = "\nRun '" + c.help + "' for usage.\n";
        ASSERT_GE(run.err.size(), hint.size());
        EXPECT_EQ(run.err.substr(run.err.size() - hint.size()), hint) << run.err;
    }
}

}  // namespace
