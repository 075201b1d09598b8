#include "survey/InputParameter.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

namespace {

// Parses a command line given as texts; the first one is the program name.
class CommandLine {
public:
    explicit CommandLine(std::vector<std::string> arguments) : _arguments(std::move(arguments)) {
        _pointers.reserve(_arguments.size() + 1);
        std::transform(_arguments.begin(), _arguments.end(), std::back_inserter(_pointers),
                       [](std::string& argument) { return argument.data(); });
        _pointers.push_back(nullptr);
    }

    unsigned int argc() const { return static_cast<unsigned int>(_arguments.size()); }
    char** argv() { return _pointers.data(); }

private:
    std::vector<std::string> _arguments;
    std::vector<char*> _pointers;
};

constexpr char gc_Program[] = "quorvexPYLON_VPD_Survey_ClientPartition";

TEST(InputParameter, DefaultConstructedHoldsNoOption) {
    Utility::InputParameter const parameters;
    EXPECT_FALSE(parameters.contains("-c"));
}

TEST(InputParameter, MachineOptionTakesTheNextArgumentAsValue) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    ASSERT_TRUE(parameters.contains("-c"));
    EXPECT_EQ(parameters["-c"], "1234-ABC_10ABCDE");
}

TEST(InputParameter, CommandLineOfOnlyMachineOptionGivesItAnEmptyValue) {
    CommandLine line({gc_Program, "-c"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    ASSERT_TRUE(parameters.contains("-c"));
    EXPECT_EQ(parameters["-c"], "");
}

TEST(InputParameter, MachineOptionFollowedByAnotherOptionGetsAnEmptyValue) {
    CommandLine line({gc_Program, "-c", "-v", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    EXPECT_EQ(parameters["-c"], "");
    ASSERT_TRUE(parameters.contains("-v"));
    EXPECT_EQ(parameters["-v"], "1234-ABC_10ABCDE");
}

TEST(InputParameter, FirstOfTwoMachineOptionsWins) {
    CommandLine line({gc_Program, "-c", "1111-AAA_FIRST", "-c", "2222-BBB_SECOND"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    EXPECT_EQ(parameters["-c"], "1111-AAA_FIRST");
}

TEST(InputParameter, RepeatedOptionWithoutValueFirstKeepsItsEmptyValue) {
    CommandLine line({gc_Program, "-c", "-c", "2222-BBB_SECOND"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    EXPECT_EQ(parameters["-c"], "");
}

TEST(InputParameter, PlainArgumentBeforeMachineOptionIsIgnored) {
    CommandLine line({gc_Program, "extra", "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    EXPECT_EQ(parameters["-c"], "1234-ABC_10ABCDE");
    EXPECT_FALSE(parameters.contains("extra"));
}

TEST(InputParameter, PlainArgumentAloneGivesNoMachineOption) {
    CommandLine line({gc_Program, "1234-ABC_10ABCDE"});
    Utility::InputParameter const parameters(line.argc(), line.argv());
    EXPECT_FALSE(parameters.contains("-c"));
    EXPECT_FALSE(parameters.contains("1234-ABC_10ABCDE"));
}

TEST(InputParameter, ProgramNameIsNeverAnOption) {
    CommandLine line({"-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter const parameters(line.argc(), line.argv());
    EXPECT_FALSE(parameters.contains("-c"));
}

TEST(InputParameter, ValueTakenByAnOptionIsNotParsedAgain) {
    CommandLine line({gc_Program, "-x", "value", "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    EXPECT_EQ(parameters["-x"], "value");
    EXPECT_EQ(parameters["-c"], "1234-ABC_10ABCDE");
    EXPECT_FALSE(parameters.contains("value"));
}

TEST(InputParameter, EmptyArgumentAfterAnOptionIsItsValue) {
    CommandLine line({gc_Program, "-c", "", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    ASSERT_TRUE(parameters.contains("-c"));
    EXPECT_EQ(parameters["-c"], "");
}

TEST(InputParameter, ZeroArgumentCountGivesNoOption) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter const parameters(0, line.argv());
    EXPECT_FALSE(parameters.contains("-c"));
}

TEST(InputParameter, NullArgumentVectorGivesNoOption) {
    Utility::InputParameter const parameters(3, nullptr);
    EXPECT_FALSE(parameters.contains("-c"));
}

// A count that takes in the closing null pointer of the argument vector: the
// null entry is neither an option nor a value.
TEST(InputParameter, ClosingNullEntryAfterAnOptionGivesItAnEmptyValue) {
    CommandLine line({gc_Program, "-c"});
    Utility::InputParameter parameters(line.argc() + 1, line.argv());
    ASSERT_TRUE(parameters.contains("-c"));
    EXPECT_EQ(parameters["-c"], "");
}

TEST(InputParameter, ClosingNullEntryAfterAValueIsSkipped) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc() + 1, line.argv());
    ASSERT_TRUE(parameters.contains("-c"));
    EXPECT_EQ(parameters["-c"], "1234-ABC_10ABCDE");
}

TEST(InputParameter, CopyConstructorYieldsAnEmptyMap) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter const original(line.argc(), line.argv());
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    Utility::InputParameter const copy(original);
    EXPECT_TRUE(original.contains("-c"));
    EXPECT_FALSE(copy.contains("-c"));
}

TEST(InputParameter, MovingGoesThroughTheCopyConstructorAndYieldsAnEmptyMap) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter original(line.argc(), line.argv());
    // The map has no move constructor: moving takes the deliberate copy
    // constructor, which copies nothing.
    Utility::InputParameter const moved(std::move(original)); // NOLINT(performance-move-const-arg)
    EXPECT_FALSE(moved.contains("-c"));
}

TEST(InputParameter, AssignmentCopiesTheMap) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter const original(line.argc(), line.argv());
    Utility::InputParameter assigned;
    assigned = original;
    ASSERT_TRUE(assigned.contains("-c"));
    EXPECT_EQ(assigned["-c"], "1234-ABC_10ABCDE");
}

TEST(InputParameter, SelfAssignmentKeepsTheMap) {
    CommandLine line({gc_Program, "-c", "1234-ABC_10ABCDE"});
    Utility::InputParameter parameters(line.argc(), line.argv());
    Utility::InputParameter& same = parameters;
    parameters = same;
    EXPECT_EQ(parameters["-c"], "1234-ABC_10ABCDE");
}

TEST(InputParameter, LookingUpAnAbsentOptionAddsItWithAnEmptyValue) {
    Utility::InputParameter parameters;
    EXPECT_EQ(parameters["-c"], "");
    EXPECT_TRUE(parameters.contains("-c"));
}

} // namespace
