#include "fleet/ProgressLine.h"

#include "fleet/Progress.h"
#include "fleet/TerminalWidth.h"

#include <ostream>

namespace fleet {

namespace {

constexpr auto gc_ProgressInterval = std::chrono::milliseconds(200);
constexpr char gc_EraseLine[] = "\r\033[K";

// From the row below an open row back to just after its text (columns
// count from 1).
std::string backToOpenRow(std::size_t openColumns) {
    return "\033[A\033[" + std::to_string(openColumns + 1) + "G";
}

} // namespace

ProgressLine::ProgressLine(bool enabled, std::ostream& out, int descriptor)
    : _enabled(enabled), _out(out), _descriptor(descriptor) {}

bool ProgressLine::isDue(Clock::time_point now) const {
    return _enabled && now - _lastDraw >= gc_ProgressInterval;
}

std::size_t ProgressLine::columns() const {
    return terminalColumns(_descriptor);
}

void ProgressLine::draw(std::string const& line, Clock::time_point now) {
    if (!_enabled) {
        return;
    }
    _lastDraw = now;
    _shown = true;
    std::string const fitted = fitToWidth(line, columns());
    if (_openColumns == 0) {
        _out << gc_EraseLine << fitted << std::flush;
        return;
    }
    _out << "\n\r" << fitted << "\033[K" << backToOpenRow(_openColumns) << std::flush;
}

void ProgressLine::erase() {
    if (!_shown) {
        return;
    }
    _shown = false;
    if (_openColumns == 0) {
        _out << gc_EraseLine << std::flush;
        return;
    }
    _out << "\033[B" << gc_EraseLine << backToOpenRow(_openColumns) << std::flush;
}

bool ProgressLine::isRowOpen() const {
    return _openColumns > 0;
}

void ProgressLine::leaveOpenRow(std::size_t openColumns) {
    _openColumns = openColumns;
}

} // namespace fleet
