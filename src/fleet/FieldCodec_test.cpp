#include "fleet/FieldCodec.h"

#include <gtest/gtest.h>

namespace {

using fleet::decodeFields;
using fleet::encodeFields;
using fleet::FieldRecord;

TEST(FieldCodec, RecordsComeBackByteForByte) {
    std::string const awkward("a:b;c,\n\0d\xff", 10);
    std::vector<FieldRecord> const records = {{"", "12:", awkward}, {}, {"x"}};
    std::string text;
    for (auto const& record : records) {
        text += encodeFields(record);
    }
    auto const decoded = decodeFields(text);
    ASSERT_TRUE(decoded.has_value());
    EXPECT_EQ(*decoded, records);
}

TEST(FieldCodec, EncodingIsCountThenLengthPrefixedFields) {
    EXPECT_EQ(encodeFields({"ab", ""}), "2:2:ab0:");
}

TEST(FieldCodec, EmptyTextIsNoRecord) {
    auto const decoded = decodeFields("");
    ASSERT_TRUE(decoded.has_value());
    EXPECT_TRUE(decoded->empty());
}

TEST(FieldCodec, TextCutShortIsRejected) {
    std::string const whole = encodeFields({"alpha", "beta"});
    for (std::size_t length = 1; length < whole.size(); ++length) {
        EXPECT_FALSE(decodeFields(whole.substr(0, length)).has_value()) << length;
    }
}

TEST(FieldCodec, MalformedCountsAreRejected) {
    EXPECT_FALSE(decodeFields("x:").has_value());
    EXPECT_FALSE(decodeFields(":").has_value());
    EXPECT_FALSE(decodeFields("1:5:ab").has_value());
    EXPECT_FALSE(decodeFields("99999999999999999999999:").has_value());
}

} // namespace
