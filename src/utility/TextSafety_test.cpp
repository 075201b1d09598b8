#include "utility/TextSafety.h"

#include <gtest/gtest.h>

namespace {

constexpr char replacement[] = "\xEF\xBF\xBD";

TEST(TextSafety, EscapesTheFiveMarkupCharacters) {
    EXPECT_EQ("&lt;img src=x onerror=alert(1)&gt;",
              util::escapeHtml("<img src=x onerror=alert(1)>"));
    EXPECT_EQ("a&amp;b&lt;c&quot;d&#39;e&gt;", util::escapeHtml("a&b<c\"d'e>"));
}

TEST(TextSafety, AlreadyEscapedTextIsEscapedAgainSoItShowsAsWritten) {
    EXPECT_EQ("&amp;amp;", util::escapeHtml("&amp;"));
}

TEST(TextSafety, KeepsWellFormedUtf8) {
    std::string const text = "h\xC3\xB6st \xE2\x82\xAC \xF0\x9F\x96\xA5";
    EXPECT_EQ(text, util::validUtf8(text));
    EXPECT_EQ(text, util::escapeHtml(text));
}

TEST(TextSafety, ReplacesEachByteThatIsNotUtf8) {
    EXPECT_EQ(std::string("a") + replacement + "b", util::validUtf8("a\xFF"
                                                                    "b"));
    EXPECT_EQ(std::string(replacement) + replacement, util::validUtf8("\xC3\xC3"));
}

TEST(TextSafety, ReplacesTruncatedSequenceAtTheEnd) {
    EXPECT_EQ(std::string("x") + replacement + replacement, util::validUtf8("x\xE2\x82"));
}

TEST(TextSafety, ReplacesOverlongFormsSurrogatesAndCodePointsPastTheLast) {
    EXPECT_EQ(std::string(replacement) + replacement, util::validUtf8("\xC0\xAF"));
    EXPECT_EQ(std::string(replacement) + replacement + replacement,
              util::validUtf8("\xED\xA0\x80"));
    EXPECT_EQ(std::string(replacement) + replacement + replacement + replacement,
              util::validUtf8("\xF4\x90\x80\x80"));
}

TEST(TextSafety, KeepsNulAndControlBytes) {
    std::string const text("a\0b\tc", 5);
    EXPECT_EQ(text, util::validUtf8(text));
}

TEST(TextSafety, EntityTableHasTheFiveSpecialCharactersAndNothingElse) {
    EXPECT_EQ(util::htmlEntityOf('&'), "&amp;");
    EXPECT_EQ(util::htmlEntityOf('<'), "&lt;");
    EXPECT_EQ(util::htmlEntityOf('>'), "&gt;");
    EXPECT_EQ(util::htmlEntityOf('"'), "&quot;");
    EXPECT_EQ(util::htmlEntityOf('\''), "&#39;");
    for (char const plain : {'a', ' ', ';', '#', '\0', '\xC3'}) {
        EXPECT_TRUE(util::htmlEntityOf(plain).empty()) << static_cast<int>(plain);
    }
}

} // namespace
