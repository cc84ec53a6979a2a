// tiler-blocks-cli search: numeric options out of their range, values that are no numbers and
// templates that are not templates are refused with status 2 before anything is searched.

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <limits>
#include <nlohmann/json.hpp>

#include "QuilterParams.h"
#include "archive/FileIO.h"
#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

class SearchOptionsCli : public ::testing::Test {
  protected:
    void SetUp() override {
        m_dir = fs::temp_directory_path() /
                ("tb-search-options-" +
                 std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()));
        fs::remove_all(m_dir);
        fs::create_directories(m_dir);
        // Three copies of one sequence: one block over all of them, found at once.
        std::ofstream(Path("three.fa")) << ">a\nMKVLWWWCAGHYKLM\n>b\nMKVLWWWCAGHYKLM\n"
                                           ">c\nMKVLWWWCAGHYKLM\n";
    }
    void TearDown() override { fs::remove_all(m_dir); }
    std::string Path(const std::string& name) const { return (m_dir / name).string(); }

    CRun Search(std::vector<std::string> options) const {
        std::vector<std::string> args = {"search", "--quiet", "--format", "json"};
        args.insert(args.end(), options.begin(), options.end());
        args.push_back(Path("three.fa"));
        return RunTool(args);
    }
    // Refused with status 2, a message and no block table.
    void ExpectRefused(const std::vector<std::string>& options) const {
        const CRun run = Search(options);
        EXPECT_EQ(run.status, 2) << options[0] << " " << options.back();
        EXPECT_EQ(run.out, "") << options[0] << " " << options.back();
        EXPECT_NE(run.err, "") << options[0] << " " << options.back();
    }
    std::string Template(const std::string& name, const CQuilterParams& params) const {
        WriteFileAtomically(Path(name), params.TemplateBytes());
        return Path(name);
    }

    fs::path m_dir;
};

TEST_F(SearchOptionsCli, ExpectationLimitsArePositiveNumbers) {
    for (const char* value : {"nan", "NaN", "-nan", "inf", "-inf", "infinity", "1e999", "-1", "0",
                              "-0", "-1e-9", "abc", "1e-4x", ""}) {
        ExpectRefused({"--evalue", value});
    }
    const CRun refused = Search({"--evalue", "nan"});
    EXPECT_NE(refused.err.find("--evalue"), std::string::npos) << refused.err;

    for (const auto& [value, expected] :
         std::vector<std::pair<std::string, double>>{{"1e-300", 1e-300}, {"0.5", 0.5}, {"7", 7}}) {
        const CRun run = Search({"--evalue", value});
        ASSERT_EQ(run.status, 0) << value << run.err;
        EXPECT_DOUBLE_EQ(nlohmann::json::parse(run.out)["parameters"]["evalue"], expected);
    }
}

TEST_F(SearchOptionsCli, IntegerOptionsStayInTheirRange) {
    const std::vector<std::pair<std::string, std::vector<std::string>>> refused = {
        {"--cutoff", {"0", "-5", "abc", "33.5", "2147483648", "99999999999999999999", "", "12a"}},
        {"--min-seqs", {"1", "0", "-3", "x", "2.5", "4294967298", ""}},
        {"--threads", {"0", "-1", "1025", "many", "1.5", "18446744073709551617", ""}},
    };
    for (const auto& [option, values] : refused) {
        for (const std::string& value : values)
            ExpectRefused({option, value});
    }
}

TEST_F(SearchOptionsCli, ExtremeButValidValuesSearch) {
    // A cutoff nothing reaches: no blocks, and done.
    const CRun highest = Search({"--cutoff", "2147483647"});
    ASSERT_EQ(highest.status, 0) << highest.err;
    EXPECT_TRUE(nlohmann::json::parse(highest.out)["blocks"].empty());

    // A minimum above the number of molecules is lowered to it.
    const CRun most = Search({"--min-seqs", "2147483647", "--threads", "1"});
    ASSERT_EQ(most.status, 0) << most.err;
    const nlohmann::json result = nlohmann::json::parse(most.out);
    EXPECT_EQ(result["parameters"]["min_seqs"], 3);
    ASSERT_EQ(result["blocks"].size(), 1u);
    EXPECT_EQ(result["blocks"][0]["len"], 15);

    EXPECT_EQ(Search({"--threads", "1024"}).status, 0);
}

TEST_F(SearchOptionsCli, TemplatesMustBeTemplates) {
    std::ofstream(Path("notes.bp1")) << "just some text\n";
    const CRun text = Search({"--template", Path("notes.bp1")});
    EXPECT_EQ(text.status, 2);
    EXPECT_EQ(text.out, "");
    EXPECT_NE(text.err.find(CQuilterParams::NotTemplateMessage(Path("notes.bp1"))),
              std::string::npos)
        << text.err;

    // A project is not a template either.
    const CRun saved = Search({"--save", Path("p.bpr")});
    ASSERT_EQ(saved.status, 0) << saved.err;
    EXPECT_EQ(Search({"--template", Path("p.bpr")}).status, 2);

    CQuilterParams params;
    const std::vector<std::uint8_t> bytes = params.TemplateBytes();
    WriteFileAtomically(Path("cut.bp1"), std::span(bytes).first(bytes.size() - 3));
    const CRun cut = Search({"--template", Path("cut.bp1")});
    EXPECT_EQ(cut.status, 2);
    EXPECT_NE(cut.err.find(CQuilterParams::TemplateFormatErrorMessage(Path("cut.bp1"))),
              std::string::npos)
        << cut.err;

    // The limits of the options hold for the values a template brings.
    for (double limit : {std::nan(""), -1.0, std::numeric_limits<double>::infinity()}) {
        params.SetExpectationLimit(limit);
        EXPECT_EQ(Search({"--template", Template("limit.bp1", params)}).status, 2) << limit;
    }
    params.SetExpectationLimit(0.25);
    params.SetMinSequences(3);
    const CRun good = Search({"--template", Template("good.bp1", params)});
    ASSERT_EQ(good.status, 0) << good.err;
    EXPECT_DOUBLE_EQ(nlohmann::json::parse(good.out)["parameters"]["evalue"], 0.25);
}

}  // namespace
