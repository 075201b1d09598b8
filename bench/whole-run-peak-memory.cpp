// Part of bench/whole-run: preloaded into the survey tool, it writes the
// process's own peak resident memory (VmHWM, in kilobytes) to the file named
// by QUORVEX_PEAK_MEMORY_FILE when the process exits. The shells and console
// tools the survey starts do not inherit it.

#include <cstdlib>
#include <fstream>
#include <string>

namespace {

std::string u_read_PeakKilobytes() {
    std::ifstream status("/proc/self/status");
    std::string line;
    while (std::getline(status, line)) {
        if (line.rfind("VmHWM:", 0) == 0) {
            return std::to_string(std::strtol(line.c_str() + 6, nullptr, 10));
        }
    }
    return "0";
}

__attribute__((constructor)) void u_keep_FromChildren() {
    ::unsetenv("LD_PRELOAD");
}

__attribute__((destructor)) void u_write_PeakMemory() {
    char const* const path = std::getenv("QUORVEX_PEAK_MEMORY_FILE");
    if (path != nullptr) {
        std::ofstream(path) << u_read_PeakKilobytes() << "\n";
    }
}

} // namespace
