#include "fleet/TerminalWidth.h"

#include <sys/ioctl.h>

namespace fleet {

std::size_t terminalColumns(int descriptor) {
    winsize size{};
    return ioctl(descriptor, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

} // namespace fleet
