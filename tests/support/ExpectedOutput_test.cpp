#include "ExpectedOutput.h"

#include "ChildProcess.h"
#include "TemporaryFiles.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <iostream>
#include <string>
#include <utility>
#include <vector>

namespace {

using QuorvexTest::matchesExpectedFile;

constexpr char gc_UpdateVariable[] = "QUORVEX_UPDATE_EXPECTED";

// The comparison is made in a child process whose environment holds the
// given update and CI settings (nullptr: unset); the result is 0 when it
// passed and 1 when it failed, and the message goes to standard error.
QuorvexTest::CommandResult u_compareWith(char const* update, char const* ci,
                                         std::string const& actual,
                                         std::string const& expectedPath) {
    return QuorvexTest::runInChild([=]() {
        for (auto const& [variable, value] :
             {std::pair{gc_UpdateVariable, update}, std::pair{"CI", ci}}) {
            if (value == nullptr) {
                ::unsetenv(variable);
            } else {
                ::setenv(variable, value, 1);
            }
        }
        ::testing::AssertionResult const result = matchesExpectedFile(actual, expectedPath);
        std::cerr << result.message();
        return result ? 0 : 1;
    });
}

class ExpectedOutputFile : public ::testing::Test {
protected:
    ExpectedOutputFile() : _expected(_folder.file("expected")) {
        QuorvexTest::writeFile(_expected, "line 1\nline 2\n");
    }

    QuorvexTest::TemporaryDirectory const _folder;
    std::string const _expected;
};

TEST_F(ExpectedOutputFile, SameBytesPass) {
    EXPECT_EQ(u_compareWith(nullptr, nullptr, "line 1\nline 2\n", _expected).exitStatus, 0);
}

TEST_F(ExpectedOutputFile, DifferentBytesFailNamingTheFileAndTheFirstDifferentLine) {
    QuorvexTest::CommandResult const result =
        u_compareWith(nullptr, nullptr, "line 1\nline two\n", _expected);
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.stderrText.rfind("the output differs from " + _expected +
                                          ": first differing byte at offset 12 (line 2, column 6): "
                                          "expected \"2\\n\", got \"two\\n\" (set ",
                                      0),
              0u)
        << result.stderrText;
    EXPECT_EQ(QuorvexTest::readFile(_expected), "line 1\nline 2\n");
}

TEST_F(ExpectedOutputFile, MissingFileFails) {
    QuorvexTest::CommandResult const result =
        u_compareWith(nullptr, nullptr, "text", _folder.file("missing"));
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_FALSE(QuorvexTest::fileExists(_folder.file("missing")));
}

TEST_F(ExpectedOutputFile, UpdateRewritesTheFileAndStillFailsSayingSo) {
    QuorvexTest::CommandResult const result =
        u_compareWith("1", nullptr, "line 1\nline two\n", _expected);
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.stderrText, "rewrote " + _expected +
                                     " from this run because QUORVEX_UPDATE_EXPECTED=1; review "
                                     "the change and run again without it");
    EXPECT_EQ(QuorvexTest::readFile(_expected), "line 1\nline two\n");
    EXPECT_EQ(QuorvexTest::listFolder(_folder.path()), std::vector<std::string>{"expected"});
}

TEST_F(ExpectedOutputFile, UpdateWritesAMissingFileAndFails) {
    std::string const missing = _folder.file("missing");
    EXPECT_EQ(u_compareWith("1", nullptr, "new\n", missing).exitStatus, 1);
    EXPECT_EQ(QuorvexTest::readFile(missing), "new\n");
}

TEST_F(ExpectedOutputFile, UpdateWithSameBytesPassesAndLeavesTheFile) {
    EXPECT_EQ(u_compareWith("1", nullptr, "line 1\nline 2\n", _expected).exitStatus, 0);
}

TEST_F(ExpectedOutputFile, UpdateIsRefusedOnABuildServer) {
    QuorvexTest::CommandResult const result =
        u_compareWith("1", "true", "line 1\nline two\n", _expected);
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.stderrText,
              "QUORVEX_UPDATE_EXPECTED=1 is refused because CI is set: expected-output files are "
              "never rewritten on a build server (" +
                  _expected + ")");
    EXPECT_EQ(QuorvexTest::readFile(_expected), "line 1\nline 2\n");
}

TEST_F(ExpectedOutputFile, OnlyTheValueOneAsksForAnUpdate) {
    EXPECT_EQ(u_compareWith("yes", nullptr, "other\n", _expected).exitStatus, 1);
    EXPECT_EQ(QuorvexTest::readFile(_expected), "line 1\nline 2\n");
}

} // namespace
