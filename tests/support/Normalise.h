#pragma once
// The parts of a run's text that vary from run to run, made fixed so that
// outputs can be compared byte for byte.

#include <string>

namespace QuorvexTest {

// How the generated part of the shell command runner's temporary file names
// is replaced.
enum class TemporaryNames {
    // Every name becomes "/tmp/ShellCommand.XXXXXX".
    Masked,
    // The first distinct name becomes "/tmp/ShellCommand.aaaaaa", the second
    // "bbbbbb" and so on up to "zzzzzz", then "n26", "n27", ...; a name met
    // again gets the same replacement, so pairs of names stay visible.
    Numbered
};

// text with the six generated characters of every "/tmp/ShellCommand.XXXXXX"
// temporary file name replaced as style says.
std::string normaliseTemporaryNames(std::string const& text,
                                    TemporaryNames style = TemporaryNames::Masked);

// Replaces the value of every timestamp="..." attribute that holds whole
// seconds from first to last (as 13 digits ending in "000") by
// "1700000000000"; other values stay as they are.
std::string normaliseTimeStamps(std::string const& text, long first, long last);

} // namespace QuorvexTest
