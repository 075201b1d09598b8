#include "utility/StringUtility.h"

#include <gtest/gtest.h>

#include <chrono>

#include <string>
#include <vector>

namespace {

using Pieces = std::vector<std::string>;

TEST(StringUtility_concatenate, PiecesFollowEachOtherUnchanged) {
    std::string const middle = "b c";
    EXPECT_EQ(StringUtility::concatenate({"a::", middle, std::string(2, '\0'), "\n"}),
              std::string("a::b c\0\0\n", 9));
}

TEST(StringUtility_concatenate, NoPiecesOrEmptyPiecesGiveEmptyText) {
    EXPECT_EQ(StringUtility::concatenate({}), "");
    EXPECT_EQ(StringUtility::concatenate({"", std::string()}), "");
}

TEST(StringUtility_splitString, TrailingDelimiterGivesNoTrailingEmptyPiece) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("a;b;", ";", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"a", "b"}));
}

TEST(StringUtility_splitString, LeadingDelimiterKeepsLeadingEmptyPiece) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString(";a", ";", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"", "a"}));
}

TEST(StringUtility_splitString, DoubledDelimiterKeepsInnerEmptyPiece) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("a;;b", ";", pieces), 3);
    EXPECT_EQ(pieces, (Pieces{"a", "", "b"}));
}

TEST(StringUtility_splitString, DelimiterAloneGivesOneEmptyPiece) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString(";", ";", pieces), 1);
    EXPECT_EQ(pieces, (Pieces{""}));
}

TEST(StringUtility_splitString, MultiCharacterDelimiterMatchesAsWholeString) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("a::b:c", "::", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"a", "b:c"}));
}

TEST(StringUtility_splitString, EmptyTextReturnsZeroAndLeavesPiecesUntouched) {
    Pieces pieces{"kept", "too"};
    EXPECT_EQ(StringUtility::splitString("", ";", pieces), 0);
    EXPECT_EQ(pieces, (Pieces{"kept", "too"}));
}

TEST(StringUtility_splitString, EmptyDelimiterReturnsZeroAndLeavesPiecesUntouched) {
    Pieces pieces{"kept"};
    EXPECT_EQ(StringUtility::splitString("abc", "", pieces), 0);
    EXPECT_EQ(pieces, (Pieces{"kept"}));
}

TEST(StringUtility_splitString, TextWithoutDelimiterGivesWholeText) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("abc", ";", pieces), 1);
    EXPECT_EQ(pieces, (Pieces{"abc"}));
}

TEST(StringUtility_splitString, ReplacesEarlierPieces) {
    Pieces pieces{"old", "older", "oldest"};
    EXPECT_EQ(StringUtility::splitString("x;y", ";", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"x", "y"}));
}

TEST(StringUtility_splitString, MatchIsCaseSensitive) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("aXbxc", "x", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"aXb", "c"}));
}

TEST(StringUtility_splitString, SearchRestartsAfterEachDelimiter) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("a:::b", "::", pieces), 2);
    EXPECT_EQ(pieces, (Pieces{"a", ":b"}));
}

TEST(StringUtility_splitString, ConsoleLineWithEmptyFields) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("Rc::0::::RetStr1::done::", "::", pieces), 5);
    EXPECT_EQ(pieces, (Pieces{"Rc", "0", "", "RetStr1", "done"}));
}

TEST(StringUtility_splitString, DelimiterOnlyTextGivesEmptyPiecesWithoutTrailingOne) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString(";;;", ";", pieces), 3);
    EXPECT_EQ(pieces, (Pieces{"", "", ""}));
}

TEST(StringUtility_splitString, DelimiterLongerThanTextGivesText) {
    Pieces pieces;
    EXPECT_EQ(StringUtility::splitString("a", "::::", pieces), 1);
    EXPECT_EQ(pieces, (Pieces{"a"}));
}

} // namespace

TEST(StringUtility_splitString, LineOfAMillionFieldsSplitsInLinearTime) {
    // Cutting the front off the text for every field would move about
    // 5 * 10^11 bytes here, far beyond the time limit.
    std::string const text(1000000, ';');
    std::vector<std::string> pieces;
    auto const start = std::chrono::steady_clock::now();
    EXPECT_EQ(StringUtility::splitString(text, ";", pieces), 1000000);
    auto const elapsed = std::chrono::steady_clock::now() - start;
    EXPECT_EQ(pieces.size(), 1000000U);
    EXPECT_TRUE(pieces.back().empty());
    EXPECT_LT(elapsed, std::chrono::seconds(10));
}
