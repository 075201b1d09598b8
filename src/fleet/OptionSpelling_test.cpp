#include "fleet/OptionSpelling.h"

#include <gtest/gtest.h>

namespace {

using fleet::closestOption;
using fleet::editDistance;
using fleet::typedOptionName;

std::vector<std::string> const gc_Known{"--help",  "--jobs", "--timeout", "--summary",
                                        "--quiet", "--all",  "--report",  "--version"};

TEST(OptionSpelling, EditDistanceCountsInsertedRemovedAndReplacedLetters) {
    EXPECT_EQ(editDistance("--sumary", "--summary"), 1U);
    EXPECT_EQ(editDistance("--summary", "--sumary"), 1U);
    EXPECT_EQ(editDistance("--jbos", "--jobs"), 2U);
    EXPECT_EQ(editDistance("", "--all"), 5U);
    EXPECT_EQ(editDistance("--all", "--all"), 0U);
}

TEST(OptionSpelling, AMissingLetterSuggestsTheOption) {
    EXPECT_EQ(closestOption("--sumary", gc_Known), std::optional<std::string>("--summary"));
}

TEST(OptionSpelling, AUniqueBeginningSuggestsTheOption) {
    EXPECT_EQ(closestOption("--job", gc_Known), std::optional<std::string>("--jobs"));
    EXPECT_EQ(closestOption("--ti", gc_Known), std::optional<std::string>("--timeout"));
}

TEST(OptionSpelling, TwoSwappedLettersSuggestTheOption) {
    EXPECT_EQ(closestOption("--qiuet", gc_Known), std::optional<std::string>("--quiet"));
}

TEST(OptionSpelling, AFarSpellingSuggestsNothing) {
    EXPECT_EQ(closestOption("--frobnicate", gc_Known), std::nullopt);
    EXPECT_EQ(closestOption("--xyz", gc_Known), std::nullopt);
}

TEST(OptionSpelling, ShortOptionsAreNotGuessedAt) {
    EXPECT_EQ(closestOption("-x", gc_Known), std::nullopt);
    EXPECT_EQ(closestOption("--", gc_Known), std::nullopt);
}

TEST(OptionSpelling, TypedNameDropsAnAttachedValue) {
    EXPECT_EQ(typedOptionName("--sumary=x.json"), "--sumary");
    EXPECT_EQ(typedOptionName("--sumary"), "--sumary");
    EXPECT_EQ(typedOptionName("-x"), "-x");
}

} // namespace
