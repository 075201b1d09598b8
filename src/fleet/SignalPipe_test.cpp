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

TEST(SignalPipe, SignalsAreNamedAsTheRunReportsThem) {
    EXPECT_STREQ(fleet::signalName(SIGTERM), "SIGTERM");
    EXPECT_STREQ(fleet::signalName(SIGINT), "SIGINT");
}

} // namespace
