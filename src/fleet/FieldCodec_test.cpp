#include "fleet/FieldCodec.h"

#include <gtest/gtest.h>

namespace {

using Fleet::FieldCodec;

TEST(FieldCodec, RecordsComeBackByteForByte) {
    std::string const awkward("a:b;c,\n\0d\xff", 10);
    std::vector<FieldCodec::Record> const records = {{"", "12:", awkward}, {}, {"x"}};
    std::string text;
    for (auto const& record : records) {
        text += FieldCodec::encode(record);
    }
    auto const decoded = FieldCodec::decode(text);
    ASSERT_TRUE(decoded.has_value());
    EXPECT_EQ(*decoded, records);
}

TEST(FieldCodec, EncodingIsCountThenLengthPrefixedFields) {
    EXPECT_EQ(FieldCodec::encode({"ab", ""}), "2:2:ab0:");
}

TEST(FieldCodec, EmptyTextIsNoRecord) {
    auto const decoded = FieldCodec::decode("");
    ASSERT_TRUE(decoded.has_value());
    EXPECT_TRUE(decoded->empty());
}

TEST(FieldCodec, TextCutShortIsRejected) {
    std::string const whole = FieldCodec::encode({"alpha", "beta"});
    for (std::size_t length = 1; length < whole.size(); ++length) {
        EXPECT_FALSE(FieldCodec::decode(whole.substr(0, length)).has_value()) << length;
    }
}

TEST(FieldCodec, MalformedCountsAreRejected) {
    EXPECT_FALSE(FieldCodec::decode("x:").has_value());
    EXPECT_FALSE(FieldCodec::decode(":").has_value());
    EXPECT_FALSE(FieldCodec::decode("1:5:ab").has_value());
    EXPECT_FALSE(FieldCodec::decode("99999999999999999999999:").has_value());
}

} // namespace
