#include "fleet/Progress.h"

#include <cmath>
#include <cstdio>

namespace fleet {

std::string clockText(double seconds) {
    long const whole = seconds < 0 ? 0 : static_cast<long>(seconds);
    char text[32];
    std::snprintf(text, sizeof text, "%02ld:%02ld:%02ld", whole / 3600, whole / 60 % 60,
                  whole % 60);
    return text;
}

std::optional<double> estimateLeft(ProgressFigures const& figures) {
    std::size_t const finished = figures.surveyed + figures.failed;
    if (finished == 0 || figures.partitions < finished) {
        return std::nullopt;
    }
    return figures.elapsedSeconds / static_cast<double>(finished) *
           static_cast<double>(figures.partitions - finished);
}

std::string formatProgress(ProgressFigures const& figures) {
    std::optional<double> const& left = figures.leftSeconds;
    std::string line = "machines " + std::to_string(figures.machinesDone) + "/" +
                       std::to_string(figures.machines) + "  partitions " +
                       std::to_string(figures.surveyed) + " ok " + std::to_string(figures.failed) +
                       " failed " + std::to_string(figures.running) + " running /" +
                       std::to_string(figures.partitions) + "  " +
                       clockText(figures.elapsedSeconds) + " elapsed, ~" +
                       (left ? clockText(*left) : std::string("--:--:--")) + " left";
    if (!figures.longestName.empty()) {
        line += "  longest: " + figures.longestName + " (" +
                std::to_string(static_cast<long>(std::floor(figures.longestSeconds))) + " s)";
    }
    return line;
}

std::string fitToWidth(std::string const& line, std::size_t columns) {
    if (columns == 0 || line.size() < columns) {
        return line;
    }
    return line.substr(0, columns - 1);
}

} // namespace fleet
