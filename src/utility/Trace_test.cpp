#include "utility/Trace.h"

#include "utility/ShellCommand.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <iostream>
#include <regex>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

class TraceTest : public ::testing::Test {
protected:
    void SetUp() override { _scratch = QuorvexTest::scratchDirectory(); }
    void TearDown() override { QuorvexTest::removeScratchDirectory(); }

    std::string path(std::string const& name) const { return _scratch + "/" + name; }

    std::string _scratch;
};

// Says what went wrong in a child process; its exit status carries the verdict.
int failWith(std::string const& reason) {
    std::cerr << reason << std::endl;
    return 1;
}

// Sets a time zone whose local time at this moment is secondOfDay (seconds
// after midnight), so the clock reads a chosen time without being faked.
void setLocalTimeNow(long secondOfDay) {
    long const day = 24L * 60 * 60;
    long offsetEast = (secondOfDay - static_cast<long>(std::time(nullptr) % day)) % day;
    if (offsetEast > day / 2) {
        offsetEast -= day;
    }
    if (offsetEast <= -day / 2) {
        offsetEast += day;
    }
    // The zone's offset counts west of Greenwich as positive.
    long const west = offsetEast < 0 ? -offsetEast : offsetEast;
    char zone[64] = {0};
    std::snprintf(zone, sizeof zone, "QVX%c%02ld:%02ld:%02ld", offsetEast > 0 ? '-' : '+',
                  west / 3600, west / 60 % 60, west % 60);
    ::setenv("TZ", zone, 1);
    ::tzset();
}

// Writes the time stamp at the chosen local time into file through a trace.
void writeTimeStampAt(std::string const& file, long secondOfDay) {
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace trace(file);
        setLocalTimeNow(secondOfDay);
        Utility::timeStamp(trace);
        trace.flush();
        return 0;
    });
}

// --- one shared file ---

TEST_F(TraceTest, TwoRunsLeaveOnlyTheSecondRunsText) {
    std::string const file = path("run.Trace");
    QuorvexTest::writeFile(file, "an older trace that is longer than the new ones\n");
    for (std::string const text : {"first run", "second run"}) {
        QuorvexTest::runInFreshProcess([&] {
            Utility::Trace trace(file);
            trace << text << std::endl;
            return 0;
        });
    }
    EXPECT_EQ(QuorvexTest::readFile(file), "second run\n");
}

TEST_F(TraceTest, SecondNameIsIgnoredAndWritesGoToFirstFile) {
    std::string const first = path("first.Trace");
    std::string const second = path("second.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace firstTrace(first);
        Utility::Trace secondTrace(second);
        firstTrace << "through the first" << std::endl;
        secondTrace << "through the second" << std::endl;
        firstTrace << "first again" << std::endl;
        return 0;
    });
    EXPECT_EQ(QuorvexTest::readFile(first), "through the first\nthrough the second\nfirst again\n");
    EXPECT_FALSE(QuorvexTest::fileExists(second));
}

TEST_F(TraceTest, FailedOpenIsNeverRetried) {
    std::string const good = path("good.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace failed(path("missing/folder.Trace"));
        Utility::Trace later(good);
        later << "lost" << std::endl;
        if (later.rdbuf()->is_open()) {
            return failWith("the second name was opened");
        }
        if (!later.bad()) {
            return failWith("writing without an open file did not fail");
        }
        return 0;
    });
    EXPECT_FALSE(QuorvexTest::fileExists(good));
}

TEST_F(TraceTest, TextWrittenBeforeTheOpenIsLostForThatObject) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace unit("");
        unit << "too early" << std::endl;
        Utility::Trace mainTrace(file);
        mainTrace << "main" << std::endl;
        unit << "still lost" << std::endl;
        Utility::Trace laterUnit("");
        laterUnit << "later unit" << std::endl;
        if (!unit.fail()) {
            return failWith("the early writer left its failed state");
        }
        return 0;
    });
    EXPECT_EQ(QuorvexTest::readFile(file), "main\nlater unit\n");
}

TEST_F(TraceTest, DestroyingMainTraceWhileUnitTraceLivesKeepsFileOpen) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace unit("");
        {
            Utility::Trace mainTrace(file);
            mainTrace << "from main" << std::endl;
        }
        if (!unit.rdbuf()->is_open()) {
            return failWith("the file was closed while a trace object lives");
        }
        unit << "from the unit" << std::endl;
        return 0;
    });
    EXPECT_EQ(QuorvexTest::readFile(file), "from main\nfrom the unit\n");
}

TEST_F(TraceTest, LastTraceObjectClosesTheFileAndWritesBufferedText) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        std::filebuf* shared = nullptr;
        {
            Utility::Trace mainTrace(file);
            shared = mainTrace.rdbuf();
            mainTrace << "buffered, no flush";
        }
        if (shared->is_open()) {
            return failWith("the file stayed open after the last trace object");
        }
        if (QuorvexTest::readFile(file) != "buffered, no flush") {
            return failWith("closing did not write the buffered text");
        }
        // Ends without running exit handlers: the text got there on close.
        std::_Exit(0);
    });
    EXPECT_EQ(QuorvexTest::readFile(file), "buffered, no flush");
}

TEST_F(TraceTest, ClassWideMembersFollowTheObjectsLifetimes) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        int const before = Utility::Trace::ms_ObjectCounter;
        Utility::Trace unit("");
        // cppcheck-suppress knownConditionTrueFalse ; trace objects change the class-wide members
        if (Utility::Trace::ms_IsInitialized) {
            return failWith("an empty name marked the file as initialised");
        }
        // cppcheck-suppress knownConditionTrueFalse ; trace objects change the class-wide members
        if (Utility::Trace::ms_ObjectCounter != before + 1) {
            return failWith("constructing a trace object did not count it");
        }
        {
            Utility::Trace mainTrace(file);
            // cppcheck-suppress knownConditionTrueFalse ; trace objects change the class-wide
            // members
            if (!Utility::Trace::ms_IsInitialized || !Utility::Trace::ms_FileHandle.is_open()) {
                return failWith("the first name did not open the shared file");
            }
            if (mainTrace.rdbuf() != &Utility::Trace::ms_FileHandle) {
                return failWith("the stream does not write into the shared file");
            }
            // cppcheck-suppress knownConditionTrueFalse ; trace objects change the class-wide
            // members
            if (Utility::Trace::ms_ObjectCounter != before + 2) {
                return failWith("the second trace object was not counted");
            }
        }
        // cppcheck-suppress knownConditionTrueFalse ; trace objects change the class-wide members
        if (Utility::Trace::ms_ObjectCounter != before + 1) {
            return failWith("destroying a trace object did not uncount it");
        }
        return 0;
    });
}

TEST_F(TraceTest, AllObjectsShareOneBuffer) {
    Utility::Trace first("");
    Utility::Trace second("");
    EXPECT_EQ(first.rdbuf(), second.rdbuf());
    EXPECT_EQ(first.rdbuf(), static_cast<std::ostream&>(first).rdbuf());
}

TEST_F(TraceTest, TraceHasNoPrefixOrTimeStampOfItsOwn) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace mainTrace(file);
        mainTrace << "PYLON_VPD_Survey_ClientPartition::main" << std::endl;
        mainTrace << 42 << ' ' << -1;
        mainTrace.flush();
        return 0;
    });
    EXPECT_EQ(QuorvexTest::readFile(file), "PYLON_VPD_Survey_ClientPartition::main\n42 -1");
}

TEST_F(TraceTest, ShellCommandRunWritesExactBlock) {
    std::string const file = path("main.Trace");
    std::string const command = R"(sh -c "printf 'out\n'; printf 'err1\nerr2' >&2; exit 2")";
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace mainTrace(file);
        Utility::ShellCommand shellCommand(command);
        return shellCommand.execute() == 2 ? 0 : failWith("unexpected code");
    });
    std::string const trace = QuorvexTest::readFile(file);
    EXPECT_EQ(QuorvexTest::normaliseTemporaryNames(trace),
              "\n****** ShellCommand::execute ******\n" + command +
                  " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\n"
                  "RC = 2\n"
                  "STDOUT\nout\n\n"
                  "STDERR\nerr1\nerr2\n"
                  "\n\n");
    std::smatch names;
    ASSERT_TRUE(std::regex_search(
        trace, names,
        std::regex(
            " > (/tmp/ShellCommand\\.[A-Za-z0-9]{6}) 2> (/tmp/ShellCommand\\.[A-Za-z0-9]{6})\n")));
    EXPECT_NE(names[1].str(), names[2].str());
    EXPECT_FALSE(QuorvexTest::fileExists(names[1].str()));
    EXPECT_FALSE(QuorvexTest::fileExists(names[2].str()));
}

// Someone watching the trace sees which command runs, also one that hangs.
TEST_F(TraceTest, ShellCommandLineIsInTheFileWhileTheCommandRuns) {
    std::string const file = path("main.Trace");
    std::string const command = "cat " + file;
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace mainTrace(file);
        mainTrace << "before\n";
        Utility::ShellCommand shellCommand(command);
        shellCommand.execute();
        std::vector<std::string> const expected{
            "before", "", "****** ShellCommand::execute ******",
            command + " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX", ""};
        std::vector<std::string> seen(shellCommand.get_stdout().size());
        std::transform(
            shellCommand.stdout_begin(), shellCommand.stdout_end(), seen.begin(),
            [](std::string const& line) { return QuorvexTest::normaliseTemporaryNames(line); });
        return seen == expected ? 0 : failWith("the command saw another trace");
    });
}

// The block is flushed at its end: the whole of it is in the file once
// execute returns, with the trace still open.
TEST_F(TraceTest, ShellCommandBlockIsWholeInTheFileWhenExecuteReturns) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace mainTrace(file);
        Utility::ShellCommand shellCommand("echo out");
        shellCommand.execute();
        std::string const text = QuorvexTest::normaliseTemporaryNames(QuorvexTest::readFile(file));
        return text == "\n****** ShellCommand::execute ******\n"
                       "echo out > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\n"
                       "RC = 0\nSTDOUT\nout\n\nSTDERR\n\n\n\n"
                   ? 0
                   : failWith("not flushed: " + text);
    });
}

TEST_F(TraceTest, RepeatedRunsTraceAllLinesSoFar) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace mainTrace(file);
        Utility::ShellCommand shellCommand("echo line");
        shellCommand.set_ExecuteOnlyOnce(false);
        shellCommand.execute();
        shellCommand.execute();
        return 0;
    });
    std::string const block = "\n****** ShellCommand::execute ******\n"
                              "echo line > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\n"
                              "RC = 0\n";
    EXPECT_EQ(QuorvexTest::normaliseTemporaryNames(QuorvexTest::readFile(file)),
              block + "STDOUT\nline\n\nSTDERR\n\n\n\n" + block +
                  "STDOUT\nline\n\nline\n\nSTDERR\n\n\n\n\n");
}

TEST_F(TraceTest, SystemFailureIsTracedAsMinusOne) {
    std::string const file = path("main.Trace");
    QuorvexTest::runInFreshProcess([&] {
        std::signal(SIGCHLD, SIG_IGN);
        Utility::Trace mainTrace(file);
        Utility::ShellCommand shellCommand("true");
        shellCommand.execute();
        return 0;
    });
    EXPECT_EQ(QuorvexTest::normaliseTemporaryNames(QuorvexTest::readFile(file)),
              "\n****** ShellCommand::execute ******\n"
              "true > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\n"
              "RC = -1\nSTDOUT\n\nSTDERR\n\n\n\n");
}

// --- time stamps ---

TEST_F(TraceTest, TimeStampPadsSingleDigitHourWithBlank) {
    std::string const file = path("time.Trace");
    writeTimeStampAt(file, 9 * 3600 + 5 * 60 + 7);
    std::string const text = QuorvexTest::readFile(file);
    // The clock may tick once between setting the zone and reading the time.
    EXPECT_TRUE(text == " 9:05:07" || text == " 9:05:08") << '"' << text << '"';
}

TEST_F(TraceTest, TimeStampWritesTwoDigitHourUnpadded) {
    std::string const file = path("time.Trace");
    writeTimeStampAt(file, 23 * 3600 + 59 * 60 + 50);
    std::string const text = QuorvexTest::readFile(file);
    EXPECT_TRUE(text == "23:59:50" || text == "23:59:51") << '"' << text << '"';
}

TEST_F(TraceTest, TimeStampAtMidnightHourIsBlankAndZero) {
    std::string const file = path("time.Trace");
    writeTimeStampAt(file, 30);
    std::string const text = QuorvexTest::readFile(file);
    EXPECT_TRUE(text == " 0:00:30" || text == " 0:00:31") << '"' << text << '"';
}

TEST_F(TraceTest, TimeStampHasClockFormatWithoutLineEnd) {
    std::string const file = path("time.Trace");
    QuorvexTest::runInFreshProcess([&] {
        Utility::Trace trace(file);
        Utility::timeStamp(trace);
        trace << "|";
        Utility::timeStamp(trace);
        trace.flush();
        return 0;
    });
    EXPECT_TRUE(std::regex_match(QuorvexTest::readFile(file),
                                 std::regex("[ 12][0-9]:[0-5][0-9]:[0-6][0-9]\\|"
                                            "[ 12][0-9]:[0-5][0-9]:[0-6][0-9]")))
        << QuorvexTest::readFile(file);
}

TEST_F(TraceTest, TimeStampIntoClosedTraceIsIgnored) {
    Utility::Trace unit("");
    Utility::timeStamp(unit);
    EXPECT_TRUE(unit.bad());
}

TEST(Utility_get_TimeStamp, HasThirteenDigitsEndingInThreeZeros) {
    std::time_t const before = std::time(nullptr);
    std::string const stamp = Utility::get_TimeStamp();
    std::time_t const after = std::time(nullptr);
    EXPECT_TRUE(std::regex_match(stamp, std::regex("[0-9]{10}000"))) << stamp;
    bool const inRange =
        stamp == std::to_string(before) + "000" || stamp == std::to_string(after) + "000";
    EXPECT_TRUE(inRange) << stamp << " not at " << before << " or " << after;
}

// --- host name ---

TEST(Utility_get_HostName, IsFirstLineOfHostnameCommand) {
    char name[256] = {0};
    ASSERT_EQ(::gethostname(name, sizeof name - 1), 0);
    EXPECT_EQ(Utility::get_HostName(), std::string(name));
}

TEST(Utility_get_HostName, SiteDomainIsEmptyByDefault) {
    EXPECT_EQ(std::string(Utility::gc_SiteDomainName), "");
}

} // namespace
