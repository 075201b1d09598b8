// The reading of environment files and the expansion of command lines that
// the scheduled survey's tests rely on, against what systemd does.

#include "EnvironmentFile.h"

#include <gtest/gtest.h>

#include <map>
#include <string>
#include <vector>

namespace {

using Words = std::vector<std::string>;

TEST(EnvironmentFile, ReadsBareAndDoubleQuotedValuesAndSkipsCommentsAndBlankLines) {
    EnvironmentFile const file("# a comment\n; another\n\nA=1\nB=\"two words\"\nC=\"\"\n"
                               "D=\"say \\\"hi\\\"\"\n");
    std::map<std::string, std::string> const expected{
        {"A", "1"}, {"B", "two words"}, {"C", ""}, {"D", "say \"hi\""}};
    EXPECT_EQ(file.variables(), expected);
}

TEST(EnvironmentFile, ALaterAssignmentReplacesAnEarlierOne) {
    EnvironmentFile file("A=1\nA=2\n");
    EXPECT_EQ(file.variables().at("A"), "2");
    file.set("A", "3");
    EXPECT_EQ(file.variables().at("A"), "3");
}

TEST(EnvironmentFile, AVariableAloneAsAWordBecomesItsWordsAndNothingWhenEmptyOrUnset) {
    EnvironmentFile const file("OPTIONS=\"--jobs  8 --wait\"\nEMPTY=\n");
    EXPECT_EQ(file.expand("/bin/p --all $OPTIONS $EMPTY $UNSET last"),
              (Words{"/bin/p", "--all", "--jobs", "8", "--wait", "last"}));
}

TEST(EnvironmentFile, ABracedVariableIsReplacedInsideItsWordAsItIs) {
    EnvironmentFile const file("DIR=\"a b\"\nN=8\n");
    EXPECT_EQ(file.expand("/bin/p --jobs=${N} x${DIR}y ${UNSET}"),
              (Words{"/bin/p", "--jobs=8", "xa by", ""}));
}

} // namespace
