#pragma once
// Comparison of an output with its expected-output file, and the rewriting of
// that file from a run.
//
// With QUORVEX_UPDATE_EXPECTED=1 in the environment, a file that differs is
// rewritten with the actual bytes and the comparison still fails, saying so,
// so that a rewrite never passes unnoticed: run again without it and review
// the change before committing. When CI is set (as on every build server) the
// rewrite is refused and the comparison fails: expected outputs change only by
// a person's hand.

#include <gtest/gtest.h>

#include <string>

namespace QuorvexTest {

// Success when actual holds exactly the bytes of the file at expectedPath.
::testing::AssertionResult matchesExpectedFile(std::string const& actual,
                                               std::string const& expectedPath);

} // namespace QuorvexTest
