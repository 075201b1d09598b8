#include "fleet/SignalPipe.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <unistd.h>

#include <csignal>
#include <iostream>

namespace {

TEST(SignalPipe, FirstSignalIsKeptAndLaterOnesChangeNothing) {
    // In a child of its own: the handlers stay out of the test program.
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        if (fleet::installSignalPipe() || fleet::signalPipeDescriptor() < 0) {
            return 1;
        }
        if (fleet::takeSignal() != 0) {
            return 2;
        }
        raise(SIGTERM);
        raise(SIGINT);
        return fleet::takeSignal() == SIGTERM && fleet::takeSignal() == SIGTERM ? 0 : 3;
    });
    EXPECT_EQ(result.exitStatus, 0) << "1: not installed; 2: a signal before any; 3: wrong signal";
}

TEST(SignalPipe, PipeThatCannotBeMadeIsReportedWithErrnoAndNoHandlerIsSet) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        std::optional<std::string> failure;
        {
            QuorvexTest::NoFreeDescriptors const exhausted;
            failure = fleet::installSignalPipe();
        }
        struct sigaction action {};
        sigaction(SIGTERM, nullptr, &action);
        bool const untouched = action.sa_handler == SIG_DFL;
        std::cout << failure.value_or("") << std::flush;
        return untouched && fleet::signalPipeDescriptor() < 0 ? 0 : 1;
    });
    EXPECT_EQ(result.exitStatus, 0) << "a handler was set or a descriptor kept";
    EXPECT_EQ(result.stdoutText, "cannot create the signal pipe: Too many open files");
}

class SignalThatStopsTheRun : public ::testing::TestWithParam<int> {};

TEST_P(SignalThatStopsTheRun, ArrivesThroughThePipe) {
    int const signalNumber = GetParam();
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([signalNumber] {
        if (fleet::installSignalPipe()) {
            return 1;
        }
        raise(signalNumber);
        return fleet::takeSignal() == signalNumber ? 0 : 2;
    });
    EXPECT_EQ(result.exitStatus, 0) << "1: not installed; 2: not seen on the pipe";
}

INSTANTIATE_TEST_SUITE_P(SignalPipe, SignalThatStopsTheRun,
                         ::testing::Values(SIGINT, SIGTERM, SIGHUP, SIGPIPE),
                         [](::testing::TestParamInfo<int> const& info) {
                             return std::string(fleet::signalName(info.param));
                         });

TEST(SignalPipe, SignalBlockedByTheStarterStillArrives) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        sigset_t blocked;
        sigemptyset(&blocked);
        sigaddset(&blocked, SIGPIPE);
        sigprocmask(SIG_BLOCK, &blocked, nullptr);
        if (fleet::installSignalPipe()) {
            return 1;
        }
        raise(SIGPIPE);
        return fleet::takeSignal() == SIGPIPE ? 0 : 2;
    });
    EXPECT_EQ(result.exitStatus, 0) << "1: not installed; 2: the signal stayed blocked";
}

TEST(SignalPipe, SignalHeldAfterTheRunEndedChangesNothing) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        if (fleet::installSignalPipe()) {
            return 1;
        }
        fleet::holdSignals();
        raise(SIGTERM);
        return fleet::takeSignal() == 0 ? 0 : 2;
    });
    EXPECT_EQ(result.exitStatus, 0) << "1: not installed; 2: the held signal reached the pipe";
}

TEST(SignalPipe, SignalsAreNamedAsTheRunReportsThem) {
    EXPECT_STREQ(fleet::signalName(SIGTERM), "SIGTERM");
    EXPECT_STREQ(fleet::signalName(SIGINT), "SIGINT");
    EXPECT_STREQ(fleet::signalName(SIGHUP), "SIGHUP");
    EXPECT_STREQ(fleet::signalName(SIGPIPE), "SIGPIPE");
}

} // namespace
