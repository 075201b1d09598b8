#include "fleet/Progress.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>

namespace fleet {

namespace {

// A survey runs its remote actions one after the other: the client run,
// then fetching its document; each may last as long as the time limit.
constexpr double gc_RemoteActionsPerSurvey = 2;

constexpr char gc_FieldSeparator[] = "  ";

// The line's fields in the order they are shown.
enum Field : std::size_t { Partitions, Machines, Elapsed, Left, Longest, FieldCount };

// The order fields are given up in when the line does not fit.
constexpr std::array<Field, 4> gc_DroppedFirst{Elapsed, Machines, Partitions, Left};

// What runs now: the partitions surveyed, and the machines listed, which
// take the place of "0 running" while only listings run.
std::string activity(ProgressFigures const& figures) {
    std::string surveys = std::to_string(figures.running) + " running";
    if (figures.listingsRunning == 0) {
        return surveys;
    }
    std::string const listings = "listing " + std::to_string(figures.listingsRunning) +
                                 (figures.listingsRunning == 1 ? " machine" : " machines");
    return figures.running == 0 ? listings : surveys + ", " + listings;
}

std::string partitionsField(ProgressFigures const& figures) {
    // While a machine is still being listed, more partitions may come.
    std::string const total =
        std::to_string(figures.partitions) + (figures.listingsPending > 0 ? "+" : "");
    return std::to_string(figures.endedWithoutFailure + figures.failed) + "/" + total +
           " partitions done, " + std::to_string(figures.failed) + " failed, " + activity(figures);
}

// "40 s", "7 min" or "2 h 5 min": a time left is read at a glance, and
// an estimate has no precision to show. Rounded up when it is a limit.
std::string durationText(double seconds, bool roundUp) {
    auto const whole = [roundUp](double value) {
        return static_cast<long>(roundUp ? std::ceil(value) : std::round(value));
    };
    if (seconds < 100) {
        return std::to_string(whole(seconds)) + " s";
    }
    long const minutes = whole(seconds / 60);
    if (minutes < 100) {
        return std::to_string(minutes) + " min";
    }
    return std::to_string(minutes / 60) + " h " + std::to_string(minutes % 60) + " min";
}

std::string leftField(std::optional<TimeLeft> const& left) {
    if (!left) {
        return "time left unknown";
    }
    return (left->isTimeLimit ? "up to " : "~") + durationText(left->seconds, left->isTimeLimit) +
           " left";
}

std::string longestField(ProgressFigures const& figures) {
    if (figures.longestName.empty()) {
        return "";
    }
    return "longest " + figures.longestName + " " +
           std::to_string(static_cast<long>(std::floor(figures.longestSeconds))) + " s";
}

std::array<std::string, FieldCount> fieldsOf(ProgressFigures const& figures) {
    return {partitionsField(figures),
            std::to_string(figures.machinesDone) + "/" + std::to_string(figures.machines) +
                " machines done",
            clockText(figures.elapsedSeconds) + " elapsed", leftField(figures.left),
            longestField(figures)};
}

std::string joined(std::array<std::string, FieldCount> const& fields) {
    std::string line;
    for (std::string const& field : fields) {
        if (!field.empty()) {
            line += (line.empty() ? "" : gc_FieldSeparator) + field;
        }
    }
    return line;
}

// The longest a partition may still run: every remote action it has not
// ended may last the whole limit, and the first began no earlier than it.
double worstLeft(double runningSeconds, unsigned int timeoutSeconds) {
    return std::max(0.0, gc_RemoteActionsPerSurvey * timeoutSeconds - runningSeconds);
}

} // namespace

std::string clockText(double seconds) {
    long const whole = seconds < 0 ? 0 : static_cast<long>(seconds);
    char text[32];
    std::snprintf(text, sizeof text, "%02ld:%02ld:%02ld", whole / 3600, whole / 60 % 60,
                  whole % 60);
    return text;
}

std::optional<TimeLeft> estimateLeft(ProgressFigures const& figures,
                                     RunningSurveys const& running) {
    std::size_t const finished = figures.endedWithoutFailure + figures.failed;
    if (figures.listingsPending > 0 || finished == 0 || figures.partitions < finished) {
        return std::nullopt;
    }
    TimeLeft left;
    left.seconds = figures.elapsedSeconds / static_cast<double>(finished) *
                   static_cast<double>(figures.partitions - finished);
    if (running.timeoutSeconds > 0) {
        for (double const seconds : running.seconds) {
            double const worst = worstLeft(seconds, running.timeoutSeconds);
            if (worst > left.seconds) {
                left = TimeLeft{worst, true};
            }
        }
    }
    return left;
}

std::string formatProgress(ProgressFigures const& figures, std::size_t columns) {
    std::array<std::string, FieldCount> fields = fieldsOf(figures);
    for (Field const field : gc_DroppedFirst) {
        if (columns == 0 || joined(fields).size() < columns) {
            break;
        }
        fields[field].clear();
    }
    return fitToWidth(joined(fields), columns);
}

// A character is a column: the cut never splits a UTF-8 sequence, so a
// console's text in any language stays valid.
std::string fitToWidth(std::string const& line, std::size_t columns) {
    if (columns == 0) {
        return line;
    }
    std::size_t characters = 0;
    for (std::size_t at = 0; at < line.size(); ++at) {
        bool const startsCharacter = (static_cast<unsigned char>(line[at]) & 0xC0U) != 0x80U;
        if (startsCharacter && ++characters == columns) {
            return line.substr(0, at);
        }
    }
    return line;
}

} // namespace fleet
