// What tiler-blocks-cli writes onto: devices and FIFOs in place, symbolic links through to their
// targets, and the system's own reason with exit status 2 when the output cannot be written.

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <fstream>

#include "SpecialFiles.h"
#include "archive/FileIO.h"
#include "cli/CliRun.h"

namespace fs = std::filesystem;

namespace {

const std::string kMyoglobins = TB_TEST_DATA_DIR "/projects/myoglobins6.fa";

std::string Contents(const fs::path& path) {
    const std::vector<std::uint8_t> bytes = ReadWholeFile(path.string());
    return std::string(bytes.begin(), bytes.end());
}

bool Mentions(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

class OutputTargetsCli : public ::testing::Test {
  protected:
    void SetUp() override {
        m_dir = fs::temp_directory_path() /
                ("tb-output-cli-" + std::to_string(::getpid()) + "-" +
                 ::testing::UnitTest::GetInstance()->current_test_info()->name());
        fs::remove_all(m_dir);
        fs::create_directories(m_dir);
        // An unprivileged child must reach the inputs.
        fs::permissions(m_dir, static_cast<fs::perms>(0755));
    }
    void TearDown() override {
        std::error_code ignored;
        fs::permissions(m_dir, fs::perms::owner_all, ignored);
        for (const auto& entry : fs::recursive_directory_iterator(m_dir, ignored))
            fs::permissions(entry.path(), fs::perms::owner_all, fs::perm_options::add, ignored);
        fs::remove_all(m_dir, ignored);
    }
    std::string Path(const std::string& name) const { return (m_dir / name).string(); }

    // A searched project with blocks, and what `msf` makes of it on a plain file.
    std::string Project() {
        const std::string path = Path("P.bpr");
        const CRun run =
            RunTool({"search", "--quiet", "--min-seqs", "3", "--save", path, kMyoglobins});
        EXPECT_EQ(run.status, 0) << run.err;
        return path;
    }
    std::string FastaExport() {
        const std::string plain = Path("plain.fa");
        EXPECT_EQ(RunTool({"export", "--format", "fasta", "-o", plain, kMyoglobins}).status, 0);
        return Contents(plain);
    }

    fs::path m_dir;
};

TEST_F(OutputTargetsCli, FullDevicesFailWithTheSystemsReason) {
    const CDeviceGuard full("/dev/full");
    if (!full.Present())
        GTEST_SKIP() << "no /dev/full";
    const std::string project = Project();
    const std::string noSpace = std::strerror(ENOSPC);
    const std::vector<std::vector<std::string>> commands = {
        {"export", "--format", "fasta", "-o", "/dev/full", kMyoglobins},
        {"search", "--quiet", "--min-seqs", "3", "--save", "/dev/full", kMyoglobins},
        {"search", "--quiet", "--min-seqs", "3", "--msf", "/dev/full", kMyoglobins},
    };
    for (const std::vector<std::string>& args : commands) {
        const CRun run = RunTool(args);
        EXPECT_EQ(run.status, 2) << args[0];
        EXPECT_TRUE(Mentions(run.err, "/dev/full: " + noSpace)) << run.err;
    }
    const CRun msf = RunTool({"msf", project, "/dev/full"});
    EXPECT_EQ(msf.status, 2);
    EXPECT_EQ(msf.err, "tiler-blocks-cli: Error opening '/dev/full' file\n" + noSpace + "\n");
    EXPECT_TRUE(full.Intact());
}

TEST_F(OutputTargetsCli, DevNullStaysADeviceEvenForTheSuperuser) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "only the superuser could replace /dev/null";
    const CDeviceGuard null("/dev/null");
    ASSERT_TRUE(null.Present());
    const std::string project = Project();
    const CRun msf = RunTool({"msf", project, "/dev/null"});
    EXPECT_EQ(msf.status, 0) << msf.err;
    EXPECT_TRUE(null.Intact());
    const CRun saved = RunTool({"search", "--quiet", "--min-seqs", "3", "--save", "/dev/null",
                                "--msf", "/dev/null", kMyoglobins});
    EXPECT_EQ(saved.status, 0) << saved.err;
    EXPECT_TRUE(null.Intact());
}

TEST_F(OutputTargetsCli, SymbolicLinksAreWrittenThroughAndStayLinks) {
    const std::string fasta = FastaExport();
    fs::create_directories(m_dir / "real");
    std::ofstream(m_dir / "real" / "out.fa") << "old";
    fs::create_symlink("real/out.fa", m_dir / "link.fa");
    ASSERT_EQ(RunTool({"export", "--format", "fasta", "-o", Path("link.fa"), kMyoglobins}).status,
              0);
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(m_dir / "link.fa")));
    EXPECT_EQ(Contents(m_dir / "real" / "out.fa"), fasta);

    // A dangling link makes its target; the project saved through it opens.
    fs::create_symlink("real/made.bpr", m_dir / "made.bpr");
    const CRun search =
        RunTool({"search", "--quiet", "--min-seqs", "3", "--save", Path("made.bpr"), kMyoglobins});
    ASSERT_EQ(search.status, 0) << search.err;
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(m_dir / "made.bpr")));
    EXPECT_TRUE(fs::is_regular_file(fs::symlink_status(m_dir / "real" / "made.bpr")));
    EXPECT_EQ(RunTool({"info", Path("real/made.bpr")}).status, 0);

    // msf through a chain of two links, the first relative, the second absolute.
    ASSERT_EQ(RunTool({"msf", Path("made.bpr"), Path("plain.msf")}).status, 0);
    std::ofstream(m_dir / "real" / "out.msf") << "old";
    fs::create_symlink(m_dir / "real" / "out.msf", m_dir / "absolute.msf");
    fs::create_symlink("absolute.msf", m_dir / "relative.msf");
    ASSERT_EQ(RunTool({"msf", Path("made.bpr"), Path("relative.msf")}).status, 0);
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(m_dir / "relative.msf")));
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(m_dir / "absolute.msf")));
    EXPECT_EQ(Contents(m_dir / "real" / "out.msf"), Contents(m_dir / "plain.msf"));
}

TEST_F(OutputTargetsCli, FifosAreWrittenInPlace) {
    const std::string fasta = FastaExport();
    const std::string fifo = Path("pipe");
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    CFifoReader reader(fifo);
    const CRun run = RunTool({"export", "--format", "fasta", "-o", fifo, kMyoglobins});
    EXPECT_EQ(reader.Take(), fasta);
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_TRUE(fs::is_fifo(fs::symlink_status(fifo)));
}

// The installed program as an unprivileged user (the superuser may write anywhere): its status
// and stderr; stdout is dropped.
std::pair<int, std::string> RunUnprivileged(const std::vector<std::string>& args,
                                            const std::string& errPath) {
    const pid_t child = ::fork();
    if (child == 0) {
        const int err = ::open(errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0666);
        const int out = ::open("/dev/null", O_WRONLY);
        if (err < 0 || out < 0 || ::dup2(err, 2) < 0 || ::dup2(out, 1) < 0)
            ::_exit(90);
        if (::geteuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0))
            ::_exit(91);
        std::vector<char*> argv = {const_cast<char*>(TB_CLI_PATH)};
        for (const std::string& arg : args)
            argv.push_back(const_cast<char*>(arg.c_str()));
        argv.push_back(nullptr);
        ::execv(TB_CLI_PATH, argv.data());
        ::_exit(92);
    }
    int status = 0;
    ::waitpid(child, &status, 0);
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, Contents(errPath)};
}

TEST_F(OutputTargetsCli, ReadOnlyFoldersAreReportedAndKeepTheirFiles) {
    const fs::path locked = m_dir / "locked";
    fs::create_directories(locked);
    std::ofstream(locked / "kept.bpr") << "previous";
    fs::permissions(locked / "kept.bpr", static_cast<fs::perms>(0666));
    fs::permissions(locked, static_cast<fs::perms>(0555));
    const std::string denied = std::strerror(EACCES);
    const std::string errPath = Path("err.txt");
    std::ofstream(errPath) << "";
    fs::permissions(errPath, static_cast<fs::perms>(0666));

    const auto [exportStatus, exportErr] = RunUnprivileged(
        {"export", "--format", "fasta", "-o", (locked / "new.fa").string(), kMyoglobins}, errPath);
    EXPECT_EQ(exportStatus, 2);
    EXPECT_TRUE(Mentions(exportErr, (locked / "new.fa").string() + ": " + denied)) << exportErr;

    const auto [searchStatus, searchErr] =
        RunUnprivileged({"search", "--quiet", "--min-seqs", "3", "--save",
                         (locked / "kept.bpr").string(), kMyoglobins},
                        errPath);
    EXPECT_EQ(searchStatus, 2);
    EXPECT_TRUE(Mentions(searchErr, denied)) << searchErr;
    EXPECT_EQ(Contents(locked / "kept.bpr"), "previous");
    EXPECT_FALSE(fs::exists(locked / "new.fa"));
}

}  // namespace
