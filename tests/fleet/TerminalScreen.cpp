#include "TerminalScreen.h"

#include <algorithm>

namespace FleetTest {

TerminalScreen::TerminalScreen(std::size_t width) : _width(width) {}

void TerminalScreen::write(std::string const& bytes) {
    for (std::size_t at = 0; at < bytes.size(); ++at) {
        char const c = bytes[at];
        if (c == '\033') {
            at = _escape(bytes, at);
        } else if (c == '\r') {
            _column = 0;
        } else if (c == '\n') {
            ++_row;
            _column = 0;
        } else {
            _put(c);
        }
    }
}

std::vector<std::string> TerminalScreen::rows() const {
    std::vector<std::string> shown;
    for (std::string row : _rows) {
        row.erase(row.find_last_not_of(' ') + 1);
        shown.push_back(row);
    }
    while (!shown.empty() && shown.back().empty()) {
        shown.pop_back();
    }
    return shown;
}

std::vector<std::string> const& TerminalScreen::unknownSequences() const {
    return _unknown;
}

void TerminalScreen::_put(char c) {
    if (_column == _width) {
        ++_row;
        _column = 0;
    }
    if (_rows.size() <= _row) {
        _rows.resize(_row + 1);
    }
    std::string& row = _rows[_row];
    if (row.size() <= _column) {
        row.resize(_column + 1, ' ');
    }
    row[_column++] = c;
}

// Handles the sequence starting at bytes[at]; returns the index of its last byte.
std::size_t TerminalScreen::_escape(std::string const& bytes, std::size_t at) {
    if (bytes.compare(at, 3, "\033[K") == 0) {
        if (_row < _rows.size() && _rows[_row].size() > _column) {
            _rows[_row].resize(_column);
        }
        return at + 2;
    }
    if (bytes.compare(at, 3, "\033[A") == 0) {
        _row = _row == 0 ? 0 : _row - 1;
        return at + 2;
    }
    if (bytes.compare(at, 3, "\033[B") == 0) {
        ++_row;
        return at + 2;
    }
    if (std::size_t const end = _columnSequenceEnd(bytes, at); end != 0) {
        std::size_t const column = std::stoul(bytes.substr(at + 2, end - at - 2));
        _column = std::min(column == 0 ? 0 : column - 1, _width - 1);
        return end;
    }
    if (bytes.compare(at, 2, "\0337") == 0) {
        _saved = {_row, _column};
        return at + 1;
    }
    if (bytes.compare(at, 2, "\0338") == 0) {
        _row = _saved.first;
        _column = _saved.second;
        return at + 1;
    }
    _unknown.push_back(bytes.substr(at, 4));
    return at;
}

// The index of the G ending an "ESC [ digits G" sequence at bytes[at]; 0 if
// there is none.
std::size_t TerminalScreen::_columnSequenceEnd(std::string const& bytes, std::size_t at) {
    if (bytes.compare(at, 2, "\033[") != 0) {
        return 0;
    }
    std::size_t const end = bytes.find_first_not_of("0123456789", at + 2);
    if (end == at + 2 || end == std::string::npos || bytes[end] != 'G') {
        return 0;
    }
    return end;
}

} // namespace FleetTest
