#include "utility/Utility__ShellCommand.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

TEST(Utility__ShellCommand_PrintText, EmptyPrefixWritesEachLineWithLineEnd) {
    std::ostringstream out;
    Utility::Utility__ShellCommand::_u_PrintText(out, {"a", "", "b"}, "");
    EXPECT_EQ(out.str(), "a\n\nb\n");
}

TEST(Utility__ShellCommand_PrintText, PrefixIsWrittenBetweenBarsBeforeEachLine) {
    std::ostringstream out;
    Utility::Utility__ShellCommand::_u_PrintText(out, {"a", ""}, "OUT");
    EXPECT_EQ(out.str(), "|OUT|a\n|OUT|\n");
}

TEST(Utility__ShellCommand_PrintText, NoLinesWriteNothing) {
    std::ostringstream out;
    Utility::Utility__ShellCommand::_u_PrintText(out, {}, "OUT");
    EXPECT_EQ(out.str(), "");
}

TEST(Utility__ShellCommand_PrintText, FlushesOnceAtTheEnd) {
    QuorvexTest::FlushCountingBuffer buffer;
    std::ostream out(&buffer);
    Utility::Utility__ShellCommand::_u_PrintText(out, {"a", "b", "c"}, "");
    EXPECT_EQ(buffer.flushes(), 1);
    EXPECT_EQ(buffer.str(), "a\nb\nc\n");
}

} // namespace
