#include "utility/AtomicFile.h"

#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <filesystem>
#include <optional>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

std::size_t entriesIn(std::string const& folder) {
    return static_cast<std::size_t>(
        std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

TEST(AtomicFile, WritesTheExactBytesAndLeavesNoTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const text("a\0b\r\n", 5);
    util::writeFileAtomically(folder.file("out"), text);
    EXPECT_EQ(text, QuorvexTest::readFile(folder.file("out")));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

TEST(AtomicFile, ReplacesAnExistingFile) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("out"), "old and longer");
    util::writeFileAtomically(folder.file("out"), "new");
    EXPECT_EQ("new", QuorvexTest::readFile(folder.file("out")));
}

// The permissions, in octal, of a file made by the writer under umask, read
// in a child process, since umask is the whole process's.
// With a mode given, the file is written with it.
std::string modeUnderUmask(mode_t mask, std::optional<mode_t> mode = std::nullopt) {
    QuorvexTest::TemporaryDirectory folder;
    auto const result = QuorvexTest::runInChild([&folder, mask, mode] {
        ::umask(mask);
        if (mode) {
            util::writeFileAtomically(folder.file("out"), "x", *mode);
        } else {
            util::writeFileAtomically(folder.file("out"), "x");
        }
        struct stat status {};
        if (::stat(folder.file("out").c_str(), &status) != 0) {
            return 1;
        }
        std::printf("%o", static_cast<unsigned int>(status.st_mode & 0777U));
        return 0;
    });
    EXPECT_EQ(0, result.exitStatus);
    return result.stdoutText;
}

TEST(AtomicFile, FileHasTheModeOfAnyNewFileUnderTheUmask) {
    EXPECT_EQ("644", modeUnderUmask(022));
    EXPECT_EQ("640", modeUnderUmask(027));
    EXPECT_EQ("664", modeUnderUmask(002));
}

TEST(AtomicFile, FileGivenAModeHasItWhateverTheUmask) {
    EXPECT_EQ("644", modeUnderUmask(077, 0644));
    EXPECT_EQ("644", modeUnderUmask(0, 0644));
}

// What writeFileAtomically throws for path, if anything.
std::optional<util::SystemError> failureWriting(std::string const& path) {
    return QuorvexTest::thrownBy<util::SystemError>(
        [&path] { util::writeFileAtomically(path, "x"); });
}

TEST(AtomicFile, MissingFolderThrowsWriteWithThePathAndEnoent) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("missing/out");
    auto const error = failureWriting(path);
    ASSERT_TRUE(error);
    EXPECT_EQ("write", error->operation());
    EXPECT_EQ(path, error->object());
    EXPECT_EQ(ENOENT, error->errorNumber());
    EXPECT_EQ("cannot write " + path + ": No such file or directory", std::string(error->what()));
}

// Root bypasses a read-only folder, but not a regular file in the folder's place.
TEST(AtomicFile, RegularFileAsFolderThrowsEnotdirWithTheExactMessage) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("plain"), "");
    std::string const path = folder.file("plain/out");
    auto const error = failureWriting(path);
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOTDIR, error->errorNumber());
    EXPECT_EQ("cannot write " + path + ": Not a directory", std::string(error->what()));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

TEST(AtomicFile, NameTooLongThrowsEnametoolong) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file(std::string(300, 'n'));
    auto const error = failureWriting(path);
    ASSERT_TRUE(error);
    EXPECT_EQ(ENAMETOOLONG, error->errorNumber());
    EXPECT_EQ("cannot write " + path + ": File name too long", std::string(error->what()));
    EXPECT_EQ(0U, entriesIn(folder.path()));
}

TEST(AtomicFile, FolderInTheWayOfTheFileThrowsEisdirAndLeavesNoTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    fs::create_directories(folder.file("out/inside"));
    auto const error = failureWriting(folder.file("out"));
    ASSERT_TRUE(error);
    EXPECT_EQ(EISDIR, error->errorNumber());
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

// A file size limit fails the write itself, for root too. The limit, the
// ignored SIGXFSZ and standard output (a file, which the limit would stop
// too) stay in the child, which ends with the errno it saw when the message
// is as expected.
TEST(AtomicFile, FailedWriteThrowsItsErrnoAndRemovesTheTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("out");
    auto const result = QuorvexTest::runInChild([&path] {
        std::signal(SIGXFSZ, SIG_IGN);
        rlimit const limit{0, 0};
        ::setrlimit(RLIMIT_FSIZE, &limit);
        auto const error = failureWriting(path);
        bool const exact =
            error && std::string(error->what()) == "cannot write " + path + ": File too large";
        return exact ? error->errorNumber() : 1;
    });
    EXPECT_EQ(EFBIG, result.exitStatus);
    EXPECT_EQ(0U, entriesIn(folder.path()));
}

// The disk's flush failing (fsync and fdatasync fail with EIO, for root
// too): the file is named, the old file stays and no temporary file is left.
// The filter stays in the child, which ends with the errno it saw when the
// message is as expected.
TEST(AtomicFile, FailedFlushToTheDiskThrowsItsErrnoAndKeepsTheOldFile) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("out");
    QuorvexTest::writeFile(path, "old");
    auto const result = QuorvexTest::runInChild([&path] {
        std::string const problem = QuorvexTest::failSystemCalls({SYS_fsync, SYS_fdatasync}, EIO);
        if (!problem.empty()) {
            std::fprintf(stderr, "%s\n", problem.c_str());
            return 1;
        }
        auto const error = failureWriting(path);
        bool const exact =
            error && std::string(error->what()) == "cannot write " + path + ": Input/output error";
        return exact ? error->errorNumber() : 2;
    });
    EXPECT_EQ(EIO, result.exitStatus) << result.stderrText;
    EXPECT_EQ("old", QuorvexTest::readFile(path));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

// A folder that cannot be opened for its flush (no read permission, as
// uid 65534 for root would read it anyway): the rename is done, the file is
// named with the folder's errno.
TEST(AtomicFile, FolderThatCannotBeFlushedNamesTheFileLeftInPlace) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const unreadable = folder.file("unreadable");
    fs::create_directory(unreadable);
    fs::permissions(folder.path(), fs::perms::owner_all | fs::perms::others_exec);
    fs::permissions(unreadable, fs::perms::all & ~(fs::perms::owner_read | fs::perms::group_read |
                                                   fs::perms::others_read));
    std::string const path = unreadable + "/out";
    auto const result = QuorvexTest::runInChild([&path] {
        if (::getuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0)) {
            return 1;
        }
        auto const error = failureWriting(path);
        bool const exact =
            error && std::string(error->what()) == "cannot write " + path + ": Permission denied";
        return exact ? error->errorNumber() : 2;
    });
    EXPECT_EQ(EACCES, result.exitStatus);
    fs::permissions(unreadable, fs::perms::owner_all);
    EXPECT_EQ("x", QuorvexTest::readFile(path));
}

} // namespace

namespace {

std::optional<util::SystemError> failureFlushing(std::string const& folder) {
    try {
        util::flushFolderToDisk(folder);
    } catch (util::SystemError const& error) {
        return error;
    }
    return std::nullopt;
}

TEST(AtomicFileFolderFlush, FolderIsFlushedWithoutFailure) {
    QuorvexTest::TemporaryDirectory folder;
    EXPECT_FALSE(failureFlushing(folder.path()).has_value());
}

// The folder flush after the rename says which folder it could not flush.
TEST(AtomicFileFolderFlush, MissingFolderThrowsWriteWithTheFolderAndEnoent) {
    QuorvexTest::TemporaryDirectory folder;
    auto const error = failureFlushing(folder.file("gone"));
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOENT, error->errorNumber());
    EXPECT_EQ("cannot write " + folder.file("gone") + ": No such file or directory",
              std::string(error->what()));
}

TEST(AtomicFileFolderFlush, FailedFlushToTheDiskThrowsWithTheFolderAndItsErrno) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const& path = folder.path();
    auto const result = QuorvexTest::runInChild([&path] {
        if (!QuorvexTest::failSystemCalls({SYS_fsync}, EIO).empty()) {
            return 1;
        }
        auto const error = failureFlushing(path);
        bool const exact =
            error && std::string(error->what()) == "cannot write " + path + ": Input/output error";
        return exact ? error->errorNumber() : 2;
    });
    EXPECT_EQ(EIO, result.exitStatus);
}

TEST(AtomicFileFolderFlush, RegularFileThrowsEnotdir) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("file"), "x");
    auto const error = failureFlushing(folder.file("file"));
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOTDIR, error->errorNumber());
}

} // namespace
