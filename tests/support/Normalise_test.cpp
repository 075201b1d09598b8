#include "Normalise.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using QuorvexTest::normaliseTemporaryNames;
using QuorvexTest::normaliseTimeStamps;
using QuorvexTest::TemporaryNames;

constexpr char gc_RunTrace[] = "ls > /tmp/ShellCommand.Ab3dE9 2> /tmp/ShellCommand.zz0011\n"
                               "cat /tmp/ShellCommand.Ab3dE9\n";

TEST(NormaliseTemporaryNames, MaskedReplacesEveryGeneratedPartByX) {
    EXPECT_EQ(normaliseTemporaryNames(gc_RunTrace),
              "ls > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\n"
              "cat /tmp/ShellCommand.XXXXXX\n");
}

TEST(NormaliseTemporaryNames, NumberedGivesEachDistinctNameItsOwnLetters) {
    EXPECT_EQ(normaliseTemporaryNames(gc_RunTrace, TemporaryNames::Numbered),
              "ls > /tmp/ShellCommand.aaaaaa 2> /tmp/ShellCommand.bbbbbb\n"
              "cat /tmp/ShellCommand.aaaaaa\n");
}

TEST(NormaliseTemporaryNames, NumberedCountsOnAfterTheTwentySixthName) {
    std::string text;
    for (int i = 0; i < 28; ++i) {
        text += "/tmp/ShellCommand.name" + std::to_string(10 + i) + " ";
    }
    std::string const normalised = normaliseTemporaryNames(text, TemporaryNames::Numbered);
    EXPECT_EQ(normalised.substr(0, 50), "/tmp/ShellCommand.aaaaaa /tmp/ShellCommand.bbbbbb ");
    EXPECT_EQ(normalised.substr(normalised.size() - 44),
              "/tmp/ShellCommand.n26 /tmp/ShellCommand.n27 ");
}

TEST(NormaliseTemporaryNames, OtherFileNamesStayAsTheyAre) {
    std::string const text = "/tmp/ShellCommand.ab /tmp/Other.Ab3dE9 /var/ShellCommand.Ab3dE9";
    EXPECT_EQ(normaliseTemporaryNames(text), text);
    EXPECT_EQ(normaliseTemporaryNames(text, TemporaryNames::Numbered), text);
}

TEST(NormaliseTimeStamps, StampsWithinTheRunBecomeTheSampleStamp) {
    EXPECT_EQ(normaliseTimeStamps("<A timestamp=\"1800000005000\"/>", 1800000000, 1800000010),
              "<A timestamp=\"1700000000000\"/>");
}

TEST(NormaliseTimeStamps, StampsOutsideTheRunStay) {
    std::string const text = R"(<A timestamp="1800000011000"/><B timestamp="1800000005123"/>)";
    EXPECT_EQ(normaliseTimeStamps(text, 1800000000, 1800000010), text);
}

} // namespace
