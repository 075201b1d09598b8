#include "fleet/TimeLimits.h"

#include "fleet/SignalPipe.h"

#include <cstdio>

namespace fleet {

namespace {

constexpr char gc_RemoteActionTool[] = "runact-api";

bool contains(std::string const& text, char const* part) {
    return text.find(part) != std::string::npos;
}

} // namespace

TimeLimits::TimeLimits(unsigned int timeoutSeconds) : _timeoutSeconds(timeoutSeconds) {}

void TimeLimits::interrupt(int signalNumber) {
    if (_signal == 0) {
        _signal = signalNumber;
    }
}

bool TimeLimits::isInterrupted() const {
    return _signal != 0;
}

int TimeLimits::interruptingSignal() const {
    return _signal;
}

bool TimeLimits::mayHaveActionToStop(double unitSeconds) const {
    return _signal != 0 ||
           (_timeoutSeconds > 0 && unitSeconds >= static_cast<double>(_timeoutSeconds));
}

bool TimeLimits::_isDue(std::optional<double> seconds) const {
    bool const overLimit =
        _timeoutSeconds > 0 && seconds && *seconds >= static_cast<double>(_timeoutSeconds);
    return _signal != 0 || overLimit;
}

std::vector<pid_t> TimeLimits::actionsToStop(UnitKind kind,
                                             std::vector<ActionFacts> const& actions) const {
    std::vector<pid_t> due;
    for (auto const& action : actions) {
        if (kind == UnitKind::Survey && !contains(action.commandLine, gc_RemoteActionTool)) {
            continue;
        }
        if (_isDue(action.seconds)) {
            due.push_back(action.pid);
        }
    }
    return due;
}

std::optional<std::string> TimeLimits::stopNote(UnitKind kind, double seconds) const {
    if (kind != UnitKind::Survey) {
        return std::nullopt;
    }
    char text[160];
    if (_signal != 0) {
        std::snprintf(text, sizeof text, "Stopped by %s after %.1f s.", signalName(_signal),
                      seconds);
    } else {
        std::snprintf(text, sizeof text, "Stopped by the time limit of %u s after %.1f s.",
                      _timeoutSeconds, seconds);
    }
    return std::string(text);
}

bool resumesAfterStop(UnitKind kind) {
    return kind != UnitKind::MachineListing;
}

} // namespace fleet
