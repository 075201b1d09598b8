#pragma once

#include <cstddef>

namespace fleet {

// The width in columns of the terminal on descriptor, read anew at every
// call so that a resized terminal is seen; 0 when it is not a terminal.
std::size_t terminalColumns(int descriptor);

} // namespace fleet
