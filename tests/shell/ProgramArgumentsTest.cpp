// What the built program answers on its command line before any window opens.

#include <gtest/gtest.h>

#include <QProcess>

namespace {

QString RunProgram(const QStringList& arguments, int* status) {
    QProcess program;
    program.start(QStringLiteral(TB_PROGRAM_PATH), arguments);
    EXPECT_TRUE(program.waitForFinished(30000));
    *status = program.exitCode();
    return QString::fromLocal8Bit(program.readAllStandardOutput());
}

TEST(ProgramArguments, VersionAndHelpNeedNoDisplay) {
    int status = -1;
    EXPECT_EQ(RunProgram({"--version"}, &status), "tiler-blocks " TB_EXPECTED_VERSION "\n");
    EXPECT_EQ(status, 0);
    const QString help = RunProgram({"--help"}, &status);
    EXPECT_EQ(status, 0);
    EXPECT_TRUE(help.startsWith("Usage: tiler-blocks")) << help.toStdString();
    EXPECT_TRUE(help.contains("--version")) << help.toStdString();
}

}  // namespace
