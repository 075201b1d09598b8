#include "fleet/Progress.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <cmath>
#include <cstdio>
#include <iostream>

namespace Fleet {

namespace {

constexpr char gc_EraseLine[] = "\r\033[K";

// From the row below an open row back to just after its text (columns
// count from 1).
std::string u_backToOpenRow(std::size_t openColumns) {
    return "\033[A\033[" + std::to_string(openColumns + 1) + "G";
}

} // namespace

std::string Progress::clock(double seconds) {
    long const whole = seconds < 0 ? 0 : static_cast<long>(seconds);
    char text[32];
    std::snprintf(text, sizeof text, "%02ld:%02ld:%02ld", whole / 3600, whole / 60 % 60,
                  whole % 60);
    return text;
}

std::optional<double> Progress::estimateLeft(ProgressFigures const& figures) {
    std::size_t const finished = figures.surveyed + figures.failed;
    if (finished == 0 || figures.partitions < finished) {
        return std::nullopt;
    }
    return figures.elapsedSeconds / static_cast<double>(finished) *
           static_cast<double>(figures.partitions - finished);
}

std::string Progress::format(ProgressFigures const& figures) {
    std::optional<double> const& left = figures.leftSeconds;
    std::string line = "machines " + std::to_string(figures.machinesDone) + "/" +
                       std::to_string(figures.machines) + "  partitions " +
                       std::to_string(figures.surveyed) + " ok " + std::to_string(figures.failed) +
                       " failed " + std::to_string(figures.running) + " running /" +
                       std::to_string(figures.partitions) + "  " + clock(figures.elapsedSeconds) +
                       " elapsed, ~" + (left ? clock(*left) : std::string("--:--:--")) + " left";
    if (!figures.longestName.empty()) {
        line += "  longest: " + figures.longestName + " (" +
                std::to_string(static_cast<long>(std::floor(figures.longestSeconds))) + " s)";
    }
    return line;
}

std::string Progress::fitToWidth(std::string const& line, std::size_t columns) {
    if (columns == 0 || line.size() < columns) {
        return line;
    }
    return line.substr(0, columns - 1);
}

void Progress::draw(std::string const& line, std::size_t openColumns) {
    winsize size{};
    std::size_t const columns = ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
    std::string const shown = fitToWidth(line, columns);
    if (openColumns == 0) {
        std::cerr << gc_EraseLine << shown << std::flush;
        return;
    }
    std::cerr << "\n\r" << shown << "\033[K" << u_backToOpenRow(openColumns) << std::flush;
}

void Progress::erase(std::size_t openColumns) {
    if (openColumns == 0) {
        std::cerr << gc_EraseLine << std::flush;
        return;
    }
    std::cerr << "\033[B" << gc_EraseLine << u_backToOpenRow(openColumns) << std::flush;
}

} // namespace Fleet
