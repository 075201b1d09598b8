#include "utility/TemporaryFile.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <regex>
#include <sys/stat.h>
#include <unistd.h>

namespace {

class TemporaryFileTest : public ::testing::Test {
protected:
    void SetUp() override { _base = QuorvexTest::scratchDirectory() + "/Base"; }
    void TearDown() override { QuorvexTest::removeScratchDirectory(); }

    std::string _base;
};

TEST_F(TemporaryFileTest, CreatesEmptyOwnerOnlyFileNamedAfterBaseWithSixCharacters) {
    Utility::TemporaryFile file(_base);
    ASSERT_TRUE(file.isValid());
    EXPECT_EQ(file.get_BaseFileName(), _base);
    std::string const name = file.get_ActualFileName();
    EXPECT_TRUE(std::regex_match(
        name,
        std::regex(std::regex_replace(_base, std::regex("\\."), "\\.") + "\\.[A-Za-z0-9]{6}")))
        << name;
    struct stat status {};
    ASSERT_EQ(::stat(name.c_str(), &status), 0);
    EXPECT_TRUE(S_ISREG(status.st_mode));
    EXPECT_EQ(status.st_size, 0);
    EXPECT_EQ(status.st_mode & 0777, 0600u);
}

TEST_F(TemporaryFileTest, TwoFilesFromOneBaseHaveDifferentNames) {
    Utility::TemporaryFile first(_base);
    Utility::TemporaryFile second(_base);
    ASSERT_TRUE(first.isValid());
    ASSERT_TRUE(second.isValid());
    EXPECT_NE(first.get_ActualFileName(), second.get_ActualFileName());
}

TEST_F(TemporaryFileTest, RemoveDeletesFileAndEmptiesBothNames) {
    Utility::TemporaryFile file(_base);
    std::string const name = file.get_ActualFileName();
    ASSERT_TRUE(QuorvexTest::fileExists(name));
    EXPECT_TRUE(file.remove());
    EXPECT_FALSE(QuorvexTest::fileExists(name));
    EXPECT_FALSE(file.isValid());
    EXPECT_EQ(file.get_ActualFileName(), "");
    EXPECT_EQ(file.get_BaseFileName(), "");
}

TEST_F(TemporaryFileTest, SecondRemoveReturnsFalse) {
    Utility::TemporaryFile file(_base);
    ASSERT_TRUE(file.remove());
    EXPECT_FALSE(file.remove());
}

TEST_F(TemporaryFileTest, FailedDeletionReturnsFalseAndChangesNothing) {
    Utility::TemporaryFile file(_base);
    std::string const name = file.get_ActualFileName();
    ASSERT_EQ(::unlink(name.c_str()), 0);
    EXPECT_FALSE(file.remove());
    EXPECT_TRUE(file.isValid());
    EXPECT_EQ(file.get_ActualFileName(), name);
    EXPECT_EQ(file.get_BaseFileName(), _base);
}

TEST_F(TemporaryFileTest, DestructorLeavesFileOnDisk) {
    std::string name;
    {
        Utility::TemporaryFile file(_base);
        name = file.get_ActualFileName();
    }
    EXPECT_TRUE(QuorvexTest::fileExists(name));
}

TEST_F(TemporaryFileTest, MissingDirectoryGivesInvalidObjectWithBaseNameKept) {
    std::string const base = QuorvexTest::scratchDirectory() + "/missing/Base";
    Utility::TemporaryFile file(base);
    EXPECT_FALSE(file.isValid());
    EXPECT_EQ(file.get_ActualFileName(), "");
    EXPECT_EQ(file.get_BaseFileName(), base);
    EXPECT_FALSE(file.remove());
    EXPECT_EQ(file.get_BaseFileName(), base);
}

TEST_F(TemporaryFileTest, CopyTakesAllThreeFields) {
    Utility::TemporaryFile file(_base);
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    Utility::TemporaryFile copy(file);
    EXPECT_TRUE(copy.isValid());
    EXPECT_EQ(copy.get_ActualFileName(), file.get_ActualFileName());
    EXPECT_EQ(copy.get_BaseFileName(), file.get_BaseFileName());
}

} // namespace
