#include "relay/ReturnCode.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <iterator>
#include <map>
#include <string>
#include <vector>

using Quorvex::RELAY::cBlankReturnCode;
using Quorvex::RELAY::ReturnCode;

using Values = std::map<std::string, std::string>;

namespace {

// Read while this unit's start-up objects are built, in whatever order the
// units are linked.
int const gc_BlankRcAtStartUp = cBlankReturnCode.get_Rc();
// A map or string not yet built has no begin node and no character buffer.
bool const gc_BlankIsBuiltAtStartUp =
    cBlankReturnCode.get_Values().begin() == cBlankReturnCode.get_Values().end() &&
    cBlankReturnCode.get_RetStr1().c_str() != nullptr;

// Every line of up to four pieces taken from tokens that break naive parsers.
std::vector<std::string> hostileLines() {
    std::vector<std::string> const pieces{"Rc", "RcCmd", "::",  ":",  "",
                                          "x",  "-1",    "abc", "\t", " "};
    std::vector<std::string> lines{""};
    for (std::size_t length = 0; length < 4; ++length) {
        std::vector<std::string> longer;
        for (std::string const& line : lines) {
            std::transform(pieces.begin(), pieces.end(), std::back_inserter(longer),
                           [&line](std::string const& piece) { return line + piece; });
        }
        lines.insert(lines.end(), longer.begin(), longer.end());
    }
    return lines;
}

} // namespace

TEST(ReturnCode, ExpectedToolLineGivesItsFourValues) {
    ReturnCode const rc("Rc::0::RcCmd::0::RetStr1::done::RetStr2::");
    EXPECT_EQ(rc.get_Values(),
              (Values{{"Rc", "0"}, {"RcCmd", "0"}, {"RetStr1", "done"}, {"RetStr2", ""}}));
    EXPECT_EQ(rc.get_Rc(), 0);
    EXPECT_EQ(rc.get_RcCmd(), 0);
    EXPECT_EQ(rc.get_RetStr1(), "done");
    EXPECT_EQ(rc.get_RetStr2(), "");
    EXPECT_TRUE(rc.contains("RetStr2"));
}

TEST(ReturnCode, PairAfterRcWinsOverTheSameKeyBeforeIt) {
    ReturnCode const rc("x::1::Rc::5::x::2");
    EXPECT_EQ(rc.get_ValueOf("Rc"), "5");
    EXPECT_EQ(rc.get_ValueOf("x"), "2");
    EXPECT_EQ(rc.get_Rc(), 5);
    EXPECT_EQ(rc.get_Values().size(), 2u);
}

TEST(ReturnCode, RcAloneGivesEmptyRcAndZero) {
    ReturnCode const rc("Rc");
    EXPECT_TRUE(rc.contains("Rc"));
    EXPECT_EQ(rc.get_ValueOf("Rc"), "");
    EXPECT_EQ(rc.get_Rc(), 0);
    EXPECT_EQ(rc.get_RcCmd(), -1);
}

TEST(ReturnCode, LineWithoutRcPairsAllTokensAndTheLastKeyGetsEmpty) {
    ReturnCode const rc("a::b::c");
    EXPECT_EQ(rc.get_Values(), (Values{{"a", "b"}, {"c", ""}}));
    EXPECT_EQ(rc.get_Rc(), -1);
}

TEST(ReturnCode, FirstOccurrenceOfAKeyWinsInsideThePartFromRc) {
    ReturnCode const rc("Rc::1::Rc::2");
    EXPECT_EQ(rc.get_ValueOf("Rc"), "1");
}

TEST(ReturnCode, LastLeadingKeyGetsEmptyWhenTheRcPartFollows) {
    ReturnCode const rc("a::b::c::Rc::0");
    EXPECT_EQ(rc.get_Values(), (Values{{"Rc", "0"}, {"a", "b"}, {"c", ""}}));
}

TEST(ReturnCode, RcAsAValueRestartsThePairing) {
    ReturnCode const rc("RetStr1::Rc::RcCmd::3");
    EXPECT_EQ(rc.get_Values(), (Values{{"Rc", "RcCmd"}, {"3", ""}, {"RetStr1", ""}}));
    EXPECT_EQ(rc.get_Rc(), 0);
    EXPECT_EQ(rc.get_RcCmd(), -1);
}

TEST(ReturnCode, SplitsAtDoubleColonsOnlyAndKeepsEmptyFields) {
    ReturnCode const rc("Rc::::RcCmd::0");
    EXPECT_EQ(rc.get_Values(), (Values{{"Rc", ""}, {"RcCmd", "0"}}));
    ReturnCode const single("Rc:0:RcCmd:1");
    EXPECT_EQ(single.get_Values(), (Values{{"Rc:0:RcCmd:1", ""}}));
}

TEST(ReturnCode, DoubleColonAloneGivesOneEmptyKey) {
    ReturnCode const rc("::");
    EXPECT_EQ(rc.get_Values(), (Values{{"", ""}}));
    EXPECT_EQ(rc.get_Rc(), -1);
}

TEST(ReturnCode, EmptyLineGivesEmptyMap) {
    ReturnCode const rc(std::string(""));
    EXPECT_TRUE(rc.get_Values().empty());
    EXPECT_EQ(rc.get_Rc(), -1);
}

TEST(ReturnCode, RcWithoutDigitsGivesZero) {
    EXPECT_EQ(ReturnCode("Rc::abc").get_Rc(), 0);
    EXPECT_EQ(ReturnCode("Rc::   ").get_Rc(), 0);
    EXPECT_EQ(ReturnCode("RcCmd::-").get_RcCmd(), 0);
}

TEST(ReturnCode, NumberConversionIsUnsignedNarrowedToThirtyTwoBits) {
    EXPECT_EQ(ReturnCode("Rc::-1").get_Rc(), -1);
    EXPECT_EQ(ReturnCode("Rc:: 3").get_Rc(), 3);
    EXPECT_EQ(ReturnCode("Rc::+5").get_Rc(), 5);
    EXPECT_EQ(ReturnCode("Rc::7xyz").get_Rc(), 7);
    EXPECT_EQ(ReturnCode("Rc::4294967295").get_Rc(), -1);
    EXPECT_EQ(ReturnCode("Rc::4294967296").get_Rc(), 0);
    EXPECT_EQ(ReturnCode("Rc::2147483648").get_Rc(), INT_MIN);
    EXPECT_EQ(ReturnCode("Rc::99999999999999999999").get_Rc(), -1);
    EXPECT_EQ(ReturnCode("Rc::0::RcCmd::-7").get_RcCmd(), -7);
}

TEST(ReturnCode, MissingKeysGiveTheMemberBlankString) {
    ReturnCode const rc("Rc::0");
    std::string const& first = rc.get_ValueOf("nothing");
    std::string const& second = rc.get_RetStr1();
    EXPECT_EQ(first, "");
    EXPECT_EQ(&first, &second);
    EXPECT_FALSE(rc.contains("nothing"));
}

TEST(ReturnCode, BlankReturnCodeHasMinusOneAndEmptyStrings) {
    EXPECT_EQ(cBlankReturnCode.get_Rc(), -1);
    EXPECT_EQ(cBlankReturnCode.get_RcCmd(), -1);
    EXPECT_EQ(cBlankReturnCode.get_RetStr1(), "");
    EXPECT_EQ(cBlankReturnCode.get_RetStr2(), "");
    EXPECT_TRUE(cBlankReturnCode.get_Values().empty());
    EXPECT_FALSE(cBlankReturnCode.contains("Rc"));
}

TEST(ReturnCode, DefaultConstructedEqualsTheBlankReturnCode) {
    ReturnCode const rc;
    EXPECT_EQ(rc.get_Values(), cBlankReturnCode.get_Values());
    EXPECT_EQ(rc.get_Rc(), -1);
}

TEST(ReturnCode, ValuesAreInKeyOrder) {
    ReturnCode const rc("RetStr2::b::RetStr1::a::RcCmd::1::Rc::0");
    auto key = rc.get_Values().begin();
    EXPECT_EQ((key++)->first, "Rc");
    EXPECT_EQ((key++)->first, "RcCmd");
    EXPECT_EQ((key++)->first, "RetStr1");
    EXPECT_EQ((key++)->first, "RetStr2");
    EXPECT_EQ(key, rc.get_Values().end());
    EXPECT_EQ(rc.get_Rc(), 0);
    EXPECT_EQ(rc.get_RetStr1(), "a");
}

TEST(ReturnCode, VeryLongLineIsParsedWhole) {
    std::string const text(200000, 'x');
    ReturnCode const rc("Rc::3::RetStr1::" + text + "::" + text);
    EXPECT_EQ(rc.get_Rc(), 3);
    EXPECT_EQ(rc.get_RetStr1(), text);
    EXPECT_EQ(rc.get_ValueOf(text), "");
}

TEST(ReturnCode, CopiesAndAssignmentsKeepTheValues) {
    ReturnCode const original("Rc::1::RetStr1::x");
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    ReturnCode const copy(original);
    ReturnCode assigned;
    assigned = original;
    EXPECT_EQ(copy.get_Values(), original.get_Values());
    EXPECT_EQ(assigned.get_Rc(), 1);
    EXPECT_EQ(assigned.get_ValueOf("missing"), "");
}

TEST(ReturnCode, BlankReturnCodeIsReadyForOtherUnitsStartUpCode) {
    EXPECT_EQ(gc_BlankRcAtStartUp, -1);
    EXPECT_TRUE(gc_BlankIsBuiltAtStartUp);
}

TEST(ReturnCode, NoLineMadeOfHostilePiecesThrows) {
    for (std::string const& line : hostileLines()) {
        ReturnCode rc;
        ASSERT_NO_THROW(rc = ReturnCode(line)) << line;
        ASSERT_NO_THROW(rc.get_RcCmd()) << line;
        if (!rc.contains("Rc")) {
            ASSERT_EQ(rc.get_Rc(), -1) << line;
        }
        ASSERT_LE(rc.get_Values().size(), line.size() / 2 + 1) << line;
    }
}
