#include "utility/WholeNumber.h"

#include <gtest/gtest.h>

namespace {

TEST(WholeNumber, TakesDigitsWithinTheLimitsTheLimitsIncluded) {
    EXPECT_EQ(util::wholeNumberWithin("1", 1, 10), 1ULL);
    EXPECT_EQ(util::wholeNumberWithin("10", 1, 10), 10ULL);
    EXPECT_EQ(util::wholeNumberWithin("007", 1, 10), 7ULL);
}

TEST(WholeNumber, RefusesNumbersOutsideTheLimits) {
    EXPECT_EQ(util::wholeNumberWithin("0", 1, 10), std::nullopt);
    EXPECT_EQ(util::wholeNumberWithin("11", 1, 10), std::nullopt);
}

TEST(WholeNumber, RefusesNumbersBeyondWhatItCanHold) {
    EXPECT_EQ(util::wholeNumberWithin("18446744073709551616", 0, ~0ULL), std::nullopt);
}

TEST(WholeNumber, RefusesEmptyTextSignsSpacesWordsAndTrailingCharacters) {
    for (char const* text : {"", "-1", "+1", " 1", "1 ", "three", "2x", "1.5", "1e3"}) {
        EXPECT_EQ(util::wholeNumberWithin(text, 0, 1000), std::nullopt) << "'" << text << "'";
    }
}

} // namespace
