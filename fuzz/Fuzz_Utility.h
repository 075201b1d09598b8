#pragma once

#include <string>
#include <vector>

// Checks and reference models shared by the fuzz targets. The reference
// models are written independently of the code under test, the way the
// console's output is described, so that a fuzz target can compare the two.
namespace Fuzz_Utility {

// Longest text of one output line that the reader keeps.
constexpr std::string::size_type gc_MaximumLineLength = 65533;

// Prints what broke and the offending text, then aborts so that the fuzzer
// keeps the input.
[[noreturn]] void u_fail(char const* what, std::string const& detail);

// Fails with what unless condition holds.
void u_require(bool condition, char const* what, std::string const& detail = std::string());

// The entries that reading a file with these contents appends: one per line,
// each cut at its first NUL byte; the read that meets the end of the file adds
// one more entry, and a line longer than the maximum is kept up to the
// maximum and ends the reading.
std::vector<std::string> u_expected_Lines(std::string const& contents);

// The pieces of text between occurrences of delimiter, found left to right;
// a trailing delimiter leaves no empty piece. Text and delimiter must not be
// empty.
std::vector<std::string> u_expected_Pieces(std::string const& text, std::string const& delimiter);

// Cuts a machine name at its last "_"; without one both parts are the name.
void u_expected_TM_SE(std::string const& name, std::string& typeModel, std::string& serial);

// Removes the console's "ZOR" prefix with the given number of characters when
// text starts with it.
std::string u_without_ConsolePrefix(std::string const& text, std::string::size_type length);

// The number a text holds when read as an unsigned decimal: leading white
// space and one sign allowed, reading ends at the first non-digit, no digits
// give 0, a negative value wraps around; sets overflow when it does not fit
// in 64 bits (the value is then the largest one).
unsigned long long u_expected_Unsigned(std::string const& text, bool& overflow, bool& hasDigits);

} // namespace Fuzz_Utility
