#include "InvocationLog.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

using PylonSim::InvocationLog;

TEST(InvocationLog, LineIsToolThenEachArgumentAfterATab) {
    EXPECT_EQ("lspartition\t-ix\t-c\t1234-ABC_10ABCDE\n",
              InvocationLog::formatLine("lspartition", {"-ix", "-c", "1234-ABC_10ABCDE"}));
}

TEST(InvocationLog, CallWithoutArgumentsIsTheToolAlone) {
    EXPECT_EQ("lsvtc\n", InvocationLog::formatLine("lsvtc", {}));
}

TEST(InvocationLog, EmptyArgumentsKeepTheirTabs) {
    EXPECT_EQ("runact-api\t\t-c\t\n", InvocationLog::formatLine("runact-api", {"", "-c", ""}));
}

TEST(InvocationLog, BackslashTabAndLineFeedAreEscaped) {
    EXPECT_EQ("runact-api\ta\\\\b\\tc\\nd\n",
              InvocationLog::formatLine("runact-api", {"a\\b\tc\nd"}));
}

TEST(InvocationLog, OtherBytesAreWrittenAsTheyAre) {
    std::string const odd = "\"quoted\" ;{x}\r\x01\xff";
    EXPECT_EQ("lsvtc\t" + odd + "\n", InvocationLog::formatLine("lsvtc", {odd}));
}

TEST(InvocationLog, TheTestSupportDecodesWhatTheLogWrites) {
    std::vector<std::string> const arguments{"a\\b\tc\nd", "", "x::y", "\\t"};
    std::string const line = InvocationLog::formatLine("runact-api", arguments);
    std::vector<QuorvexTest::Invocation> const decoded =
        QuorvexTest::parseInvocationLog(line + line);
    QuorvexTest::Invocation expected{"runact-api"};
    expected.insert(expected.end(), arguments.begin(), arguments.end());
    ASSERT_EQ(2u, decoded.size());
    EXPECT_EQ(expected, decoded[0]);
    EXPECT_EQ(expected, decoded[1]);
}

TEST(InvocationLog, AppendAddsOneLinePerCall) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const log = folder.file("calls.log");
    ASSERT_TRUE(InvocationLog::append(log, "lsvtc\t-t0\n"));
    ASSERT_TRUE(InvocationLog::append(log, "lspartition\n"));
    EXPECT_EQ("lsvtc\t-t0\nlspartition\n", QuorvexTest::readFile(log));
}

TEST(InvocationLog, AppendToAMissingFolderFails) {
    QuorvexTest::TemporaryDirectory folder;
    EXPECT_FALSE(InvocationLog::append(folder.file("missing/calls.log"), "lsvtc\n"));
}
