#include "system/MTMS.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

using Quorvex::System::MTMS;

namespace {

void expectFields(MTMS const& mtms, std::string const& typeModel, std::string const& serial) {
    EXPECT_EQ(mtms.get_MachineType_Model(), typeModel);
    EXPECT_EQ(mtms.get_Serial(), serial);
}

} // namespace

TEST(MTMS, DelimiterConstantIsUnderscore) {
    EXPECT_EQ(std::string(Quorvex::System::gc_TM_SE_Delimiter), "_");
}

TEST(MTMS, DefaultConstructorLeavesBothFieldsEmpty) {
    MTMS const mtms;
    expectFields(mtms, "", "");
    EXPECT_EQ(mtms.__StringValue(), "_");
}

TEST(MTMS, TextFormSplitsIntoTypeModelAndSerialAndJoinsBack) {
    MTMS const mtms(std::string("1234-ABC_10ABCDE"));
    expectFields(mtms, "1234-ABC", "10ABCDE");
    EXPECT_EQ(mtms.__StringValue(), "1234-ABC_10ABCDE");
    EXPECT_EQ(std::string(mtms), "1234-ABC_10ABCDE");
}

TEST(MTMS, TextFormSplitsAtLastUnderscore) {
    expectFields(MTMS(std::string("A_B-C_D")), "A_B-C", "D");
}

TEST(MTMS, TextWithoutUnderscoreGivesWholeTextInBothFields) {
    expectFields(MTMS(std::string("1234-ABC")), "1234-ABC", "1234-ABC");
}

TEST(MTMS, EmptyTextGivesErrorInBothFields) {
    expectFields(MTMS(std::string("")), "ERROR", "ERROR");
}

TEST(MTMS, TextEndingInUnderscoreGivesEmptySerial) {
    expectFields(MTMS(std::string("1234-ABC_")), "1234-ABC", "");
}

TEST(MTMS, TextWithoutDashOrUnderscoreGetsErrorAppendedToBoth) {
    expectFields(MTMS(std::string("ABCDEFG")), "ABCDEFGERROR", "ABCDEFGERROR");
}

TEST(MTMS, TypeModelWithoutDashGetsErrorAppendedToBoth) {
    expectFields(MTMS(std::string("1234MMA_10ABCDE")), "1234MMAERROR", "10ABCDEERROR");
}

TEST(MTMS, TextFormIsNotCleanedOfConsolePrefix) {
    expectFields(MTMS(std::string("ZOR*1234-ABC_ZOR*0210ABCDE")), "ZOR*1234-ABC", "ZOR*0210ABCDE");
}

TEST(MTMS, TwoStringConstructorDropsConsolePrefixOfFourAndSixCharacters) {
    expectFields(MTMS("ZOR*1234-ABC", "ZOR*0210ABCDE"), "1234-ABC", "10ABCDE");
}

TEST(MTMS, TwoStringConstructorLeavesLaterConsolePrefixUnchanged) {
    expectFields(MTMS("12ZOR-ABC", "10ZORABCDE"), "12ZOR-ABC", "10ZORABCDE");
}

TEST(MTMS, TwoStringConstructorClipsShortPrefixedValuesToEmpty) {
    expectFields(MTMS("ZOR", "ZOR12"), "", "");
}

TEST(MTMS, TwoStringConstructorAppendsNoErrorMarker) {
    expectFields(MTMS("ABC", ""), "ABC", "");
}

TEST(MTMS, AssignCleansLikeTheTwoStringConstructor) {
    MTMS mtms(std::string("1234-ABC_10ABCDE"));
    mtms.assign_TM_SE("ZOR*5678-DEF", "ZOR*0265XYZ12");
    expectFields(mtms, "5678-DEF", "65XYZ12");
}

TEST(MTMS, CopyAndAssignmentCopyBothFields) {
    MTMS const original("1234-ABC", "10ABCDE");
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    MTMS const copy(original);
    expectFields(copy, "1234-ABC", "10ABCDE");
    MTMS assigned;
    assigned = original;
    expectFields(assigned, "1234-ABC", "10ABCDE");
    MTMS const& self = assigned;
    assigned = self;
    expectFields(assigned, "1234-ABC", "10ABCDE");
}

TEST(MTMS, ToStringWithSeparatorJoinsTypeModelAndSerial) {
    EXPECT_EQ(MTMS("1234-ABC", "10ABCDE").to_String("/"), "1234-ABC/10ABCDE");
    EXPECT_EQ(MTMS("1234-ABC", "10ABCDE").to_String(""), "1234-ABC10ABCDE");
}

TEST(MTMS, ToStringReplacesFirstDashAndJoinsWithSeparator) {
    EXPECT_EQ(MTMS("1234-ABC", "10ABCDE").to_String("*", "_"), "1234*ABC_10ABCDE");
}

TEST(MTMS, ToStringWithEmptyDashReplacementAndEmptySeparator) {
    EXPECT_EQ(MTMS("1234-ABC", "10ABCDE").to_String("", ""), "1234ABC10ABCDE");
}

TEST(MTMS, ToStringReplacesOnlyTheFirstDashWithLongerText) {
    EXPECT_EQ(MTMS("12-34-AB", "S").to_String("**", "+"), "12**34-AB+S");
}

TEST(MTMS, ToStringOnTypeModelWithoutDashThrowsOutOfRange) {
    MTMS const mtms("1234ABC", "10ABCDE");
    EXPECT_THROW(mtms.to_String("*", "_"), std::out_of_range);
}

TEST(MTMS, EqualityComparesTextForms) {
    EXPECT_TRUE(MTMS("1234-ABC", "10ABCDE") == MTMS(std::string("1234-ABC_10ABCDE")));
    EXPECT_FALSE(MTMS("1234-ABC", "10ABCDE") != MTMS(std::string("1234-ABC_10ABCDE")));
    EXPECT_TRUE(MTMS("1234-ABC", "10ABCDE") != MTMS("1234-ABC", "10ABCDF"));
}

TEST(MTMS, DifferentSplitsOfTheSameTextAreEqualAndUnordered) {
    MTMS const a("A_B", "C");
    MTMS const b("A", "B_C");
    EXPECT_TRUE(a == b);
    EXPECT_FALSE(a != b);
    EXPECT_FALSE(a < b);
    EXPECT_FALSE(b < a);
}

TEST(MTMS, OrderingIsOnJoinedTextUppercaseSerialFirst) {
    EXPECT_TRUE(MTMS("A-1", "Z") < MTMS("A-1", "a"));
    EXPECT_FALSE(MTMS("A-1", "a") < MTMS("A-1", "Z"));
}

TEST(MTMS, OrderingOfPrefixTypeModelIsDecidedByUnderscore) {
    // "_" is 0x5F: it sorts after the digit "0" and before the letter "a".
    EXPECT_TRUE(MTMS("A-10", "X") < MTMS("A-1", "X"));
    EXPECT_TRUE(MTMS("A-1", "X") < MTMS("A-1a", "X"));
    EXPECT_FALSE(MTMS("A-1", "X") < MTMS("A-10", "X"));
}
