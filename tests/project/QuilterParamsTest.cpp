#include <gtest/gtest.h>

#include "ProjectFixtures.h"
#include "QuilterParams.h"

namespace {

CQuilterParams Customised() {
    CQuilterParams params;
    params.SetMatrix(CScoreMatrix("blosum80mt"));
    params.SetCutoff(20);
    params.SetMinSequences(7);
    params.SetExpectationLimit(0.01);
    params.SetTextColour(0x000080);
    params.SetLinkedTextColour(0x008000);
    params.SetPalette({0x0000FF, 0x00FF00, 0xFF0000});
    return params;
}

void ExpectSameExceptCutoff(const CQuilterParams& a, const CQuilterParams& b) {
    EXPECT_EQ(a.MinSequences(), b.MinSequences());
    EXPECT_DOUBLE_EQ(a.ExpectationLimit(), b.ExpectationLimit());
    EXPECT_EQ(a.TextColour(), b.TextColour());
    EXPECT_EQ(a.LinkedTextColour(), b.LinkedTextColour());
    EXPECT_EQ(a.Palette(), b.Palette());
    EXPECT_TRUE(a.Matrix().Equals(b.Matrix()));
}

TEST(QuilterParams, DefaultsAndBlockColours) {
    const CQuilterParams params;
    EXPECT_EQ(params.Cutoff(), 33);
    EXPECT_EQ(params.MinSequences(), 5);
    EXPECT_EQ(params.TextColour(), kNoColour);
    EXPECT_EQ(params.BlockColour(0), 0x020000FFu);
    const CQuilterParams custom = Customised();
    EXPECT_EQ(custom.BlockColour(4), 0x00FF00u);
    EXPECT_EQ(custom.BlockColour(-1), 0xFF0000u);
    CQuilterParams reset = custom;
    reset.SetDefaults();
    EXPECT_EQ(reset.Cutoff(), 33);
    EXPECT_EQ(reset.Palette().size(), 3u);  // the palette is not a default
}

TEST(QuilterParams, TemplateLoadsBackWithTheMatrixDefaultCutoff) {
    CScratchDir dir("tb_template");
    CRecordingPrompt prompt;
    ASSERT_TRUE(Customised().SaveTemplate(dir.File("t.bp1"), prompt));
    CQuilterParams loaded;
    ASSERT_TRUE(loaded.LoadTemplate(dir.File("t.bp1"), &prompt));
    EXPECT_TRUE(prompt.Messages().empty());
    ExpectSameExceptCutoff(loaded, Customised());
    EXPECT_EQ(loaded.Cutoff(), 48);  // 3 x 16, whatever was stored
}

TEST(QuilterParams, FailedSavesSayWhy) {
    CScratchDir dir("tb_template");
    CRecordingPrompt prompt;
    const std::string missing = dir.File("absent/t.bp1");
    EXPECT_FALSE(Customised().SaveTemplate(missing, prompt));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text,
              CQuilterParams::TemplateFileErrorMessage(missing) + "\nNo such file or directory");
}

TEST(QuilterParams, OtherFilesAreReportedOnlyWhenInteractive) {
    CScratchDir dir("tb_template");
    const std::string text = dir.Write("notes.txt", "just some text\n");
    CRecordingPrompt prompt;
    CQuilterParams params = Customised();
    EXPECT_TRUE(params.LoadTemplate(text, &prompt));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text, "File '" + text + "' is not a quilter template");
    ExpectSameExceptCutoff(params, Customised());
    EXPECT_EQ(params.Cutoff(), 48);

    const std::string missing = dir.File("missing.bp1");
    EXPECT_FALSE(params.LoadTemplate(missing, &prompt));
    EXPECT_EQ(prompt.Messages().back().text, "Error opening template '" + missing + "' file");
    ExpectSameExceptCutoff(params, Customised());
    EXPECT_FALSE(params.LoadTemplate(missing, nullptr));
    EXPECT_EQ(params.MinSequences(), 5);
    EXPECT_EQ(params.Matrix().Name(), "blosum62mt");
}

TEST(QuilterParams, DamagedTemplateNeverLeavesHalfReadParameters) {
    CScratchDir dir("tb_template");
    CQuilterParams stored = Customised();
    stored.SetMinSequences(9);
    const std::vector<std::uint8_t> bytes = stored.TemplateBytes();
    const std::string cut = dir.Write("cut.bp1", std::string(bytes.begin(), bytes.end() - 3));
    CRecordingPrompt prompt;
    CQuilterParams params = Customised();
    EXPECT_FALSE(params.LoadTemplate(cut, &prompt));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text, "Error loading alignment template '" + cut + "'");
    ExpectSameExceptCutoff(params, Customised());
    EXPECT_EQ(params.Cutoff(), 20);
    EXPECT_FALSE(params.LoadTemplate(cut, nullptr));
    EXPECT_EQ(params.MinSequences(), 5);
}

TEST(QuilterParams, UnreadableMatrixIsReplacedAndTheRestKept) {
    std::vector<std::uint8_t> bytes = Customised().TemplateBytes();
    // The matrix name is the first member of the matrix record: turn its type code from a
    // string into an integer.
    const std::string name = "blosum80mt";
    auto at = std::search(bytes.begin(), bytes.end(), name.begin(), name.end());
    ASSERT_NE(at, bytes.end());
    *(at - 5) = static_cast<std::uint8_t>(CArchive::Code::Int32);
    CScratchDir dir("tb_template");
    const std::string file = dir.Write("m.bp1", std::string(bytes.begin(), bytes.end()));
    CRecordingPrompt prompt;
    CQuilterParams params;
    ASSERT_TRUE(params.LoadTemplate(file, &prompt));
    EXPECT_TRUE(prompt.Messages().empty());
    EXPECT_EQ(params.Matrix().Name(), "blosum62mt");
    EXPECT_EQ(params.Cutoff(), 33);
    EXPECT_EQ(params.MinSequences(), 7);
    EXPECT_EQ(params.Palette().size(), 3u);
}

TEST(QuilterParams, StoredValuesBelowTheirLimitsAreAFormatError) {
    CQuilterParams low = Customised();
    low.SetMinSequences(1);
    CArchive out = CArchive::ForWriting();
    out.XData(low);
    CArchive in = CArchive::ForReading(out.Bytes());
    CQuilterParams read;
    EXPECT_THROW(in.XData(read), CArchiveException);
}

}  // namespace
