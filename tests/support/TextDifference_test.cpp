#include "TextDifference.h"

#include <gtest/gtest.h>

namespace {

TEST(TextDifference, NamesOffsetLineColumnAndBothTexts) {
    EXPECT_EQ(
        QuorvexTest::firstDifference("ab\ncd\n", "ab\ncx\n"),
        "first differing byte at offset 4 (line 2, column 2): expected \"d\\n\", got \"x\\n\"");
}

TEST(TextDifference, EndOfTheShorterTextIsNamedAsSuch) {
    EXPECT_EQ(QuorvexTest::firstDifference("ab", "ab\t"),
              "first differing byte at offset 2 (line 1, column 3): expected (end of text), got "
              "\"\\t\"");
}

TEST(TextDifference, EqualTextsGiveNothing) {
    EXPECT_EQ(QuorvexTest::firstDifference("same", "same"), "");
}

TEST(TextDifference, ControlAndNonAsciiBytesAreEscaped) {
    EXPECT_EQ(QuorvexTest::firstDifference("\x01", "\xff"),
              "first differing byte at offset 0 (line 1, column 1): expected \"\\x01\", got "
              "\"\\xff\"");
}

} // namespace
