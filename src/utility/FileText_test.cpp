#include "utility/FileText.h"

#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <optional>
#include <thread>
#include <unistd.h>

namespace {

// What readWholeFile throws for path, if anything.
std::optional<util::SystemError> failureReading(std::string const& path) {
    return QuorvexTest::thrownBy<util::SystemError>([&path] { util::readWholeFile(path); });
}

TEST(FileText, WriteAllDeliversMoreThanAPipeHoldsAtOnce) {
    int ends[2];
    ASSERT_EQ(0, ::pipe(ends));
    std::string const text(1 << 20, 'q');
    std::string received;
    std::thread reader([&received, &ends] {
        char block[4096];
        ssize_t n = 0;
        while ((n = ::read(ends[0], block, sizeof block)) > 0) {
            received.append(block, static_cast<std::size_t>(n));
        }
    });
    bool const written = util::writeAll(ends[1], text);
    ::close(ends[1]);
    reader.join();
    ::close(ends[0]);
    EXPECT_TRUE(written);
    EXPECT_EQ(text, received);
}

TEST(FileText, WriteAllToAReadOnlyDescriptorIsFalseWithEbadf) {
    int const descriptor = ::open("/dev/null", O_RDONLY | O_CLOEXEC);
    EXPECT_GE(descriptor, 0);
    errno = 0;
    bool const written = util::writeAll(descriptor, "x");
    int const error = errno;
    ::close(descriptor);
    EXPECT_FALSE(written);
    EXPECT_EQ(EBADF, error);
}

TEST(FileText, WriteAllOfNothingWritesNothingAndSucceeds) {
    EXPECT_TRUE(util::writeAll(-1, ""));
}

TEST(FileText, ReadWholeFileGivesTheExactBytes) {
    QuorvexTest::TemporaryDirectory folder;
    std::string text("a\0b\r\n", 5);
    text += std::string(200000, 'z');
    QuorvexTest::writeFile(folder.file("f"), text);
    EXPECT_EQ(text, util::readWholeFile(folder.file("f")));
}

TEST(FileText, ReadWholeFileOfAnEmptyFileIsEmpty) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("f"), "");
    EXPECT_EQ("", util::readWholeFile(folder.file("f")));
}

TEST(FileText, ReadWholeFileReadsProcFilesWhoseSizeIsUnknown) {
    EXPECT_EQ(0U, util::readWholeFile("/proc/self/stat").find(std::to_string(::getpid()) + " ("));
}

TEST(FileText, FileThatMayBeGoneReadsWholeWhileThereAndEmptyOnceGone) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const path = folder.file("piece");
    QuorvexTest::writeFile(path, std::string("a\0b\n", 4));
    EXPECT_EQ(util::readWholeFileOrEmpty(path), std::string("a\0b\n", 4));
    std::remove(path.c_str());
    EXPECT_EQ(util::readWholeFileOrEmpty(path), "");
    EXPECT_EQ(util::readWholeFileOrEmpty(folder.path()), "");
}

TEST(FileText, ReadingAMissingFileThrowsReadWithThePathAndEnoent) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("missing");
    auto const error = failureReading(path);
    ASSERT_TRUE(error);
    EXPECT_EQ("read", error->operation());
    EXPECT_EQ(path, error->object());
    EXPECT_EQ(ENOENT, error->errorNumber());
    EXPECT_EQ("cannot read " + path + ": No such file or directory", std::string(error->what()));
}

// A folder opens for reading; the read itself fails.
TEST(FileText, ReadingAFolderThrowsTheErrnoOfTheRead) {
    QuorvexTest::TemporaryDirectory folder;
    auto const error = failureReading(folder.path());
    ASSERT_TRUE(error);
    EXPECT_EQ(EISDIR, error->errorNumber());
    EXPECT_EQ("cannot read " + folder.path() + ": Is a directory", std::string(error->what()));
}

} // namespace
