#include "utility/AtomicFileWriter.h"

#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <filesystem>
#include <sys/resource.h>

namespace {

namespace fs = std::filesystem;

std::size_t entriesIn(std::string const& folder) {
    return static_cast<std::size_t>(
        std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

TEST(AtomicFileWriter, PiecesAreWrittenInOrderAndReplaceTheFileOnlyOnCommit) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("out"), "old");
    util::AtomicFileWriter writer(folder.file("out"), 0644);
    writer.append("first,");
    writer.append(std::string("\0second\r\n", 9));
    EXPECT_EQ("old", QuorvexTest::readFile(folder.file("out")));
    writer.commit();
    EXPECT_EQ(std::string("first,\0second\r\n", 15), QuorvexTest::readFile(folder.file("out")));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

TEST(AtomicFileWriter, WriterGoneWithoutCommitLeavesTheOldFileAndNoTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("out"), "old");
    {
        util::AtomicFileWriter writer(folder.file("out"), 0644);
        writer.append("half of it");
        EXPECT_EQ(2U, entriesIn(folder.path()));
    }
    EXPECT_EQ("old", QuorvexTest::readFile(folder.file("out")));
    EXPECT_EQ(1U, entriesIn(folder.path()));
}

// A file size limit fails the write itself, for root too; the limit and the
// ignored SIGXFSZ stay in the child, which ends with the errno it saw when
// the message is as expected.
TEST(AtomicFileWriter, FailedAppendThrowsItsErrnoAndRemovesTheTemporaryFile) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("out");
    auto const result = QuorvexTest::runInChild([&path] {
        std::signal(SIGXFSZ, SIG_IGN);
        util::AtomicFileWriter writer(path, 0644);
        writer.append("fits");
        rlimit const limit{4, 4};
        ::setrlimit(RLIMIT_FSIZE, &limit);
        try {
            writer.append("does not");
        } catch (util::SystemError const& error) {
            bool const exact =
                std::string(error.what()) == "cannot write " + path + ": File too large";
            return exact ? error.errorNumber() : 1;
        }
        return 2;
    });
    EXPECT_EQ(EFBIG, result.exitStatus);
    EXPECT_EQ(0U, entriesIn(folder.path()));
}

} // namespace
