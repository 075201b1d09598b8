#include "fleet/RunFiles.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Fleet::RunFiles;
using QuorvexTest::TemporaryDirectory;

TEST(RunFiles, TakingAPieceGivesItsBytesAndLeavesItEmptyForTheSlotsNextUnit) {
    TemporaryDirectory const folder;
    std::string const piece = folder.file("piece");
    std::string const bytes("line one\n\0two", 13);
    QuorvexTest::writeFile(piece, bytes);
    EXPECT_EQ(RunFiles::takePiece(piece), std::optional<std::string>(bytes));
    EXPECT_EQ(QuorvexTest::readFile(piece), "");
    EXPECT_EQ(RunFiles::takePiece(piece), std::optional<std::string>(""));
}

TEST(RunFiles, TakingAPieceThatDoesNotExistGivesNothing) {
    TemporaryDirectory const folder;
    EXPECT_EQ(RunFiles::takePiece(folder.file("never written")), std::nullopt);
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file("never written")));
}

TEST(RunFiles, PiecesOfOneMachineDifferBySlotAndLieBesideItsTrace) {
    std::string const trace = RunFiles::traceFile("9119-MHE_21ABCDE");
    std::string const first = RunFiles::tracePiece("9119-MHE_21ABCDE", 0);
    std::string const second = RunFiles::tracePiece("9119-MHE_21ABCDE", 1);
    EXPECT_NE(first, second);
    EXPECT_EQ(first.rfind(trace + ".piece-", 0), 0U);
    EXPECT_NE(RunFiles::tracePiece("9119-MHE_21ABCDF", 0), first);
}

TEST(RunFiles, WritingAtomicallyReplacesTheFileAndLeavesNoTemporaryName) {
    TemporaryDirectory const folder;
    std::string const target = folder.file("summary.json");
    QuorvexTest::writeFile(target, "old");
    ASSERT_TRUE(RunFiles::writeAtomically(target, "new"));
    EXPECT_EQ(QuorvexTest::readFile(target), "new");
    EXPECT_EQ(QuorvexTest::listFolder(folder.path()), (std::vector<std::string>{"summary.json"}));
}

TEST(RunFiles, WritingAtomicallyIntoAMissingFolderFailsAndWritesNothing) {
    TemporaryDirectory const folder;
    EXPECT_FALSE(RunFiles::writeAtomically(folder.file("missing/summary.json"), "text"));
    EXPECT_TRUE(QuorvexTest::listFolder(folder.path()).empty());
}

} // namespace
