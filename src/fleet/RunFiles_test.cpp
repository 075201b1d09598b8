#include "fleet/RunFiles.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <sys/wait.h>
#include <unistd.h>

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

TEST(RunFiles, APieceThatIsALinkIsRemovedUnread) {
    TemporaryDirectory const folder;
    std::string const piece = folder.file("piece");
    QuorvexTest::writeFile(folder.file("elsewhere"), "not the unit's");
    std::filesystem::create_symlink(folder.file("elsewhere"), piece);
    EXPECT_EQ(takeTracePiece(piece), std::nullopt);
    EXPECT_FALSE(std::filesystem::is_symlink(piece));
    EXPECT_EQ(QuorvexTest::readFile(folder.file("elsewhere")), "not the unit's");
}

TEST(RunFiles, PiecesOfOneMachineDifferBySlotAndLieBesideItsTrace) {
    std::string const trace = traceFilePath("9119-MHE_21ABCDE");
    std::string const first = tracePiecePath("9119-MHE_21ABCDE", 0);
    std::string const second = tracePiecePath("9119-MHE_21ABCDE", 1);
    EXPECT_NE(first, second);
    EXPECT_EQ(first.rfind(trace + ".piece-", 0), 0U);
    EXPECT_NE(tracePiecePath("9119-MHE_21ABCDF", 0), first);
}

// A PID that no process has: a child's, once it has ended and been reaped.
pid_t pidOfEndedProcess() {
    pid_t const child = ::fork();
    if (child == 0) {
        ::_exit(0);
    }
    ::waitpid(child, nullptr, 0);
    return child;
}

TEST(RunFiles, PiecesOfEndedRunsAreRemovedAndThoseOfLiveRunsKept) {
    TemporaryDirectory const folder;
    std::string const trace = "quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE.Trace";
    std::string const ended = trace + ".piece-" + std::to_string(pidOfEndedProcess()) + "-0";
    std::string const live = trace + ".piece-" + std::to_string(::getpid()) + "-3";
    for (std::string const& name : {ended, live, trace, trace + ".piece-x-0", trace + ".piece-1-",
                                    trace + ".piece-123456789012-0"}) {
        QuorvexTest::writeFile(folder.file(name), "lines");
    }
    fleet::removeTracePiecesOfEndedRuns(folder.path());
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file(ended)));
    EXPECT_TRUE(QuorvexTest::fileExists(folder.file(live)));
    EXPECT_EQ(QuorvexTest::listFolder(folder.path()).size(), 5U) << "names of no piece are kept";
}

TEST(RunFiles, AFolderThatCannotBeReadHasNoPieceToRemove) {
    TemporaryDirectory const folder;
    fleet::removeTracePiecesOfEndedRuns(folder.file("missing"));
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file("missing")));
}

TEST(RunFiles, PiecesLieInTheFolderOfTheTraces) {
    EXPECT_EQ(fleet::traceFolder(), "/var/adm/quorvex/Trace");
}

TEST(RunFiles, TheRunLockLiesHiddenInTheFolderOfTheStatusFiles) {
    EXPECT_EQ(fleet::runLockPath(), "/var/adm/quorvex/VPD/.quorvex-survey.lock");
}

} // namespace
