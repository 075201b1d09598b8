#include "vpd/Value.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Value;

TEST(VPD_Value, DefaultIsEmptyTextOfTypeString) {
    Value const value;
    EXPECT_EQ(static_cast<std::string const&>(value), "");
    EXPECT_EQ(value.get_ValueType(), 0u);
    EXPECT_EQ(value.get_String_ValueType(), "string");
}

TEST(VPD_Value, EveryTypeCodeHasItsName) {
    char const* const names[] = {"string", "string[]", "integer", "float", "boolean", "hex"};
    for (unsigned int code = 0; code < 6; ++code) {
        EXPECT_EQ(Value("x", code).get_String_ValueType(), names[code]) << "code " << code;
    }
}

TEST(VPD_Value, ReadsAsItsText) {
    Value const value("4096", 2);
    std::string const& text = value;
    EXPECT_EQ(text, "4096");
    EXPECT_EQ(value.size(), 4u);
}

TEST(VPD_Value, SetValueTypeChangesOnlyTheType) {
    Value value("0x1F", 0);
    value.set_ValueType(5);
    EXPECT_EQ(value.get_ValueType(), 5u);
    EXPECT_EQ(value.get_String_ValueType(), "hex");
    EXPECT_EQ(static_cast<std::string const&>(value), "0x1F");
}

TEST(VPD_Value, CopyKeepsTextAndType) {
    Value const value("true", 4);
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    Value const copy(value);
    EXPECT_EQ(static_cast<std::string const&>(copy), "true");
    EXPECT_EQ(copy.get_ValueType(), 4u);
}

} // namespace
