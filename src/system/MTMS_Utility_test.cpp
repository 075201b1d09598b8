#include "system/MTMS_Utility.h"

#include <gtest/gtest.h>

#include <string>

namespace {

struct Split {
    std::string typeModel = "unset";
    std::string serial = "unset";
};

Split split(std::string const& name) {
    Split result;
    ::Quorvex::System::MTMS_Utility::u_split_TM_SE(name, result.typeModel, result.serial);
    return result;
}

} // namespace

TEST(MTMS_Utility, SplitAtLastUnderscore) {
    Split const result = split("A_B_C");
    EXPECT_EQ(result.typeModel, "A_B");
    EXPECT_EQ(result.serial, "C");
}

TEST(MTMS_Utility, NameWithoutUnderscoreGoesWholeIntoBothParts) {
    Split const result = split("X");
    EXPECT_EQ(result.typeModel, "X");
    EXPECT_EQ(result.serial, "X");
}

TEST(MTMS_Utility, EmptyNameGivesTwoEmptyParts) {
    Split const result = split("");
    EXPECT_EQ(result.typeModel, "");
    EXPECT_EQ(result.serial, "");
}

TEST(MTMS_Utility, LeadingUnderscoreGivesEmptyTypeModel) {
    Split const result = split("_10ABCDE");
    EXPECT_EQ(result.typeModel, "");
    EXPECT_EQ(result.serial, "10ABCDE");
}
