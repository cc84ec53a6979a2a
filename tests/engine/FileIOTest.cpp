#include "archive/FileIO.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "SpecialFiles.h"

namespace {

namespace fs = std::filesystem;

std::string Contents(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

void Put(const fs::path& path, const std::string& text) {
    std::ofstream(path, std::ios::binary) << text;
}

// The message of the failed save, or "" when it succeeded.
std::string SaveError(const std::string& path, const std::string& text) {
    try {
        WriteFileAtomically(path, text);
        return "";
    } catch (const CFileException& e) {
        EXPECT_EQ(e.Path(), path);
        return e.what();
    }
}

// SaveError as an unprivileged user: the superuser may write into any folder, so permission
// failures are tried in a child that gave up its rights.
std::string SaveErrorUnprivileged(const std::string& path, const std::string& text) {
    if (::geteuid() != 0)
        return SaveError(path, text);
    int channel[2];
    if (::pipe(channel) != 0)
        return "no pipe";
    const pid_t child = ::fork();
    if (child == 0) {
        ::close(channel[0]);
        if (::setgid(65534) != 0 || ::setuid(65534) != 0)
            ::_exit(3);
        const std::string error = SaveError(path, text);
        const bool sent =
            ::write(channel[1], error.data(), error.size()) == static_cast<ssize_t>(error.size());
        ::_exit(sent ? 0 : 4);
    }
    ::close(channel[1]);
    std::string error;
    char buffer[512];
    for (ssize_t got; (got = ::read(channel[0], buffer, sizeof buffer)) > 0;)
        error.append(buffer, static_cast<std::size_t>(got));
    ::close(channel[0]);
    int status = 0;
    ::waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    return error;
}

class FileIOTest : public ::testing::Test {
  protected:
    void SetUp() override {
        dir = fs::temp_directory_path() /
              ("tb_fileio_" + std::to_string(::getpid()) + "_" +
               ::testing::UnitTest::GetInstance()->current_test_info()->name());
        fs::remove_all(dir);
        fs::create_directories(dir);
        // Others may pass through, as the unprivileged child must.
        fs::permissions(dir, fs::perms::owner_all | fs::perms::group_exec | fs::perms::others_exec);
    }
    void TearDown() override {
        std::error_code ignored;
        fs::permissions(dir, fs::perms::owner_all, ignored);
        fs::remove_all(dir, ignored);
    }
    // Names in the folder, the temporary files of a save included.
    std::vector<std::string> Names(const fs::path& folder) const {
        std::vector<std::string> names;
        for (const auto& entry : fs::directory_iterator(folder))
            names.push_back(entry.path().filename().string());
        std::sort(names.begin(), names.end());
        return names;
    }

    fs::path dir;
};

TEST_F(FileIOTest, RegularFilesAreReplacedKeepingTheirPermissions) {
    const fs::path file = dir / "saved.txt";
    WriteFileAtomically(file.string(), "first");
    EXPECT_EQ(Contents(file), "first");
    const mode_t mask = ::umask(0);
    ::umask(mask);
    EXPECT_EQ(fs::status(file).permissions(), static_cast<fs::perms>(0666 & ~mask));

    fs::permissions(file, static_cast<fs::perms>(0640));
    WriteFileAtomically(file.string(), std::string("second\0bytes", 12));
    EXPECT_EQ(Contents(file), std::string("second\0bytes", 12));
    EXPECT_EQ(fs::status(file).permissions(), static_cast<fs::perms>(0640));
    EXPECT_EQ(Names(dir), std::vector<std::string>{"saved.txt"});
}

TEST_F(FileIOTest, SymbolicLinksStayLinksAndTheirTargetsGetTheBytes) {
    fs::create_directories(dir / "data");
    fs::create_directories(dir / "links");
    Put(dir / "data" / "real.txt", "old");
    // A relative link in another folder, and a link to that link.
    fs::create_symlink("../data/real.txt", dir / "links" / "first");
    fs::create_symlink("first", dir / "links" / "second");

    WriteFileAtomically((dir / "links" / "second").string(), "new");
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(dir / "links" / "second")));
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(dir / "links" / "first")));
    EXPECT_EQ(fs::read_symlink(dir / "links" / "first"), "../data/real.txt");
    EXPECT_EQ(Contents(dir / "data" / "real.txt"), "new");
    // The temporary file was made, and renamed, beside the target.
    EXPECT_EQ(Names(dir / "data"), std::vector<std::string>{"real.txt"});
    EXPECT_EQ(Names(dir / "links"), (std::vector<std::string>{"first", "second"}));
}

TEST_F(FileIOTest, DanglingLinksCreateTheirTargetAndLoopsAreRefused) {
    fs::create_symlink("made.txt", dir / "dangling");
    WriteFileAtomically((dir / "dangling").string(), "created");
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(dir / "dangling")));
    EXPECT_EQ(Contents(dir / "made.txt"), "created");

    fs::create_symlink("loop-b", dir / "loop-a");
    fs::create_symlink("loop-a", dir / "loop-b");
    const std::string loop = (dir / "loop-a").string();
    EXPECT_EQ(SaveError(loop, "x"), loop + ": " + std::strerror(ELOOP));
    // A link into a folder that does not exist.
    fs::create_symlink("missing/file.txt", dir / "nowhere");
    const std::string nowhere = (dir / "nowhere").string();
    EXPECT_EQ(SaveError(nowhere, "x"), nowhere + ": " + std::strerror(ENOENT));
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(dir / "nowhere")));
}

TEST_F(FileIOTest, FifosAreWrittenInPlace) {
    const fs::path fifo = dir / "pipe";
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    // Larger than a pipe's buffer, so the writer has to wait for the reader.
    const std::string text(1 << 20, 'q');
    CFifoReader reader(fifo.string());
    EXPECT_EQ(SaveError(fifo.string(), text), "");
    const std::string received = reader.Take();
    EXPECT_EQ(received.size(), text.size());
    EXPECT_TRUE(received == text);  // not printed: a megabyte
    EXPECT_TRUE(fs::is_fifo(fs::symlink_status(fifo)));
    EXPECT_EQ(Names(dir), std::vector<std::string>{"pipe"});
}

TEST_F(FileIOTest, DevicesAreWrittenInPlaceAndReportTheirErrors) {
    const CDeviceGuard null("/dev/null");
    const CDeviceGuard full("/dev/full");
    if (!null.Present() || !full.Present())
        GTEST_SKIP() << "no /dev/null or /dev/full";
    EXPECT_EQ(SaveError("/dev/null", "discarded"), "");
    EXPECT_TRUE(null.Intact());
    EXPECT_EQ(SaveError("/dev/full", "no room"),
              std::string("/dev/full: ") + std::strerror(ENOSPC));
    EXPECT_TRUE(full.Intact());
    // Through a link, too.
    fs::create_symlink("/dev/full", dir / "full");
    const std::string link = (dir / "full").string();
    EXPECT_EQ(SaveError(link, "no room"), link + ": " + std::strerror(ENOSPC));
    EXPECT_TRUE(fs::is_symlink(fs::symlink_status(link)));
    EXPECT_TRUE(full.Intact());
}

TEST_F(FileIOTest, FoldersAndMissingFoldersAreRefused) {
    fs::create_directories(dir / "folder");
    const std::string folder = (dir / "folder").string();
    EXPECT_EQ(SaveError(folder, "x"), folder + ": " + std::strerror(EISDIR));
    EXPECT_TRUE(fs::is_directory(folder));
    const std::string missing = (dir / "absent" / "file.txt").string();
    EXPECT_EQ(SaveError(missing, "x"), missing + ": " + std::strerror(ENOENT));
    EXPECT_EQ(Names(dir), std::vector<std::string>{"folder"});
}

TEST_F(FileIOTest, ReadOnlyFoldersReportPermissionAndKeepThePreviousFile) {
    const fs::path locked = dir / "locked";
    fs::create_directories(locked);
    Put(locked / "kept.txt", "previous");
    fs::permissions(locked / "kept.txt", static_cast<fs::perms>(0666));
    fs::permissions(locked, static_cast<fs::perms>(0555));
    const std::string denied = std::strerror(EACCES);
    const std::string kept = (locked / "kept.txt").string();
    const std::string fresh = (locked / "new.txt").string();
    EXPECT_EQ(SaveErrorUnprivileged(kept, "replacement"), kept + ": " + denied);
    EXPECT_EQ(SaveErrorUnprivileged(fresh, "new"), fresh + ": " + denied);
    fs::permissions(locked, fs::perms::owner_all);
    EXPECT_EQ(Contents(locked / "kept.txt"), "previous");
    EXPECT_EQ(Names(locked), std::vector<std::string>{"kept.txt"});
}

TEST_F(FileIOTest, LongNamesStillGetATemporaryFile) {
    const fs::path file = dir / std::string(250, 'n');
    EXPECT_EQ(SaveError(file.string(), "long"), "");
    EXPECT_EQ(Contents(file), "long");
    EXPECT_EQ(Names(dir).size(), 1u);
}

}  // namespace
