#pragma once
// Where two texts that should be equal part: the offset of the first
// differing byte with its line and column, and a few bytes of each text from
// there, control characters escaped so the message shows what differs.

#include <string>

namespace QuorvexTest {

// Empty when the texts are equal.
std::string firstDifference(std::string const& expected, std::string const& actual);

} // namespace QuorvexTest
