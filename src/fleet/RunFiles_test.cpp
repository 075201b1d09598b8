#include "fleet/RunFiles.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using fleet::statusFilePath;
using fleet::takeTracePiece;
using fleet::traceFilePath;
using fleet::tracePiecePath;
using QuorvexTest::TemporaryDirectory;

TEST(RunFiles, TakingAPieceGivesItsBytesAndRemovesIt) {
    TemporaryDirectory const folder;
    std::string const piece = folder.file("piece");
    std::string const bytes("line one\n\0two", 13);
    QuorvexTest::writeFile(piece, bytes);
    EXPECT_EQ(takeTracePiece(piece), std::optional<std::string>(bytes));
    EXPECT_FALSE(QuorvexTest::fileExists(piece));
    EXPECT_EQ(takeTracePiece(piece), std::nullopt);
}

TEST(RunFiles, TakingAPieceThatDoesNotExistGivesNothing) {
    TemporaryDirectory const folder;
    EXPECT_EQ(takeTracePiece(folder.file("never written")), std::nullopt);
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file("never written")));
}

TEST(RunFiles, PiecesOfOneMachineDifferBySlotAndLieBesideItsTrace) {
    std::string const trace = traceFilePath("9119-MHE_21ABCDE");
    std::string const first = tracePiecePath("9119-MHE_21ABCDE", 0);
    std::string const second = tracePiecePath("9119-MHE_21ABCDE", 1);
    EXPECT_NE(first, second);
    EXPECT_EQ(first.rfind(trace + ".piece-", 0), 0U);
    EXPECT_NE(tracePiecePath("9119-MHE_21ABCDF", 0), first);
}

TEST(RunFiles, TheRunLockLiesHiddenInTheFolderOfTheStatusFiles) {
    EXPECT_EQ(fleet::runLockPath(), "/var/adm/quorvex/VPD/.quorvex-survey.lock");
}

} // namespace
