#include "report/AtomicFile.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>
#include <stdexcept>
#include <sys/stat.h>

namespace {

namespace fs = std::filesystem;

std::size_t entriesIn(std::string const& folder) {
    return static_cast<std::size_t>(
        std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

TEST(AtomicFile, WritesTheExactBytesAndLeavesNoTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const text("a\0b\r\n", 5);
    report::writeFileAtomically(folder.file("out"), text);
    EXPECT_EQ(text, QuorvexTest::readFile(folder.file("out")));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

TEST(AtomicFile, ReplacesAnExistingFile) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("out"), "old and longer");
    report::writeFileAtomically(folder.file("out"), "new");
    EXPECT_EQ("new", QuorvexTest::readFile(folder.file("out")));
}

// The permissions, in octal, of a file made by the writer under umask, read
// in a child process, since umask is the whole process's.
std::string modeUnderUmask(mode_t mask) {
    QuorvexTest::TemporaryDirectory folder;
    auto const result = QuorvexTest::runInChild([&folder, mask] {
        ::umask(mask);
        report::writeFileAtomically(folder.file("out"), "x");
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

TEST(AtomicFile, MissingFolderThrowsNamingThePath) {
    QuorvexTest::TemporaryDirectory folder;
    try {
        report::writeFileAtomically(folder.file("missing/out"), "x");
        FAIL() << "no exception";
    } catch (std::runtime_error const& error) {
        EXPECT_NE(std::string::npos, std::string(error.what()).find(folder.file("missing/out")));
    }
}

TEST(AtomicFile, FolderInTheWayOfTheFileThrowsAndLeavesNoTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    fs::create_directories(folder.file("out/inside"));
    EXPECT_THROW(report::writeFileAtomically(folder.file("out"), "x"), std::runtime_error);
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

} // namespace
