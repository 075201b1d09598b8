#include "ChildProcess.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <iostream>
#include <string>

namespace {

TEST(RunCommand, CapturesBothStreamsAndTheExitCode) {
    QuorvexTest::CommandResult const result =
        QuorvexTest::runShell("printf out; printf err >&2; exit 3");
    EXPECT_EQ(result.exitStatus, 3);
    EXPECT_EQ(result.stdoutText, "out");
    EXPECT_EQ(result.stderrText, "err");
}

TEST(RunCommand, CommandEndedBySignalGives128PlusTheSignal) {
    EXPECT_EQ(QuorvexTest::runShell("kill -TERM $$").exitStatus, 128 + 15);
}

TEST(RunCommand, ProgramThatCannotRunSaysSoWith127) {
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand({"/nonexistent/program"});
    EXPECT_EQ(result.exitStatus, 127);
    EXPECT_EQ(result.stderrText.rfind("cannot run /nonexistent/program: ", 0), 0u)
        << result.stderrText;
}

TEST(RunInChild, ReturnsWhatTheWorkPrintedAndItsResult) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([]() {
        std::cout << "to stdout";
        std::cerr << "to stderr";
        return 5;
    });
    EXPECT_EQ(result.exitStatus, 5);
    EXPECT_EQ(result.stdoutText, "to stdout");
    EXPECT_EQ(result.stderrText, "to stderr");
}

TEST(RunInChild, ChangesInTheChildDoNotReachThisProcess) {
    ::unsetenv("QUORVEX_CHILD_MARK");
    QuorvexTest::runInChild([]() { return ::setenv("QUORVEX_CHILD_MARK", "1", 1); });
    EXPECT_EQ(std::getenv("QUORVEX_CHILD_MARK"), nullptr);
}

TEST(RunInFreshProcess, WorkRunsInAnotherProcessWhoseChangesStayThere) {
    ::unsetenv("QUORVEX_FRESH_MARK");
    QuorvexTest::runInFreshProcess([]() {
        bool const inherited = std::getenv("QUORVEX_FRESH_MARK") != nullptr;
        ::setenv("QUORVEX_FRESH_MARK", "1", 1);
        return inherited ? 1 : 0;
    });
    EXPECT_EQ(std::getenv("QUORVEX_FRESH_MARK"), nullptr);
}

TEST(ArgumentPointers, PointIntoTheArgumentsAndEndWithNull) {
    std::vector<std::string> const argv{"/bin/echo", "a b"};
    std::vector<char*> const pointers = QuorvexTest::argumentPointers(argv);
    ASSERT_EQ(3U, pointers.size());
    EXPECT_EQ(argv[0].c_str(), pointers[0]);
    EXPECT_EQ(argv[1].c_str(), pointers[1]);
    EXPECT_EQ(nullptr, pointers[2]);
}

} // namespace
