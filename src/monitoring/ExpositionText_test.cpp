#include "monitoring/ExpositionText.h"

#include <gtest/gtest.h>

namespace {

TEST(ExpositionText, LabelValueEscapesBackslashQuoteAndLineEnd) {
    EXPECT_EQ(monitoring::labelValue("a\\b\"c\nd"), "a\\\\b\\\"c\\nd");
}

TEST(ExpositionText, LabelValueKeepsOtherMarkupAndUtf8AsTheyAre) {
    EXPECT_EQ(monitoring::labelValue("<x> & 'y' {z}=, \xC3\xA9t\xC3\xA9"),
              "<x> & 'y' {z}=, \xC3\xA9t\xC3\xA9");
}

TEST(ExpositionText, LabelValueReplacesBytesThatAreNotUtf8) {
    EXPECT_EQ(monitoring::labelValue("a\xFF"
                                     "b"),
              "a\xEF\xBF\xBD"
              "b");
}

TEST(ExpositionText, HelpTextEscapesBackslashAndLineEndButNotQuotes) {
    EXPECT_EQ(monitoring::helpText("a\\b\"c\nd"), "a\\\\b\"c\\nd");
}

} // namespace
