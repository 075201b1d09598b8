#include "history/FittedTable.h"

#include "history/DisplayText.h"

#include <algorithm>
#include <iterator>
#include <numeric>

namespace history {

namespace {

constexpr char gc_Gap[] = "  ";
// The narrowest a column is made: room for a few characters and the "…".
constexpr std::size_t gc_NarrowestColumn = 6;

std::size_t tableWidth(std::vector<std::size_t> const& widths, std::size_t indent) {
    std::size_t const gaps = widths.empty() ? 0 : (widths.size() - 1) * (sizeof(gc_Gap) - 1);
    return std::accumulate(widths.begin(), widths.end(), indent + gaps);
}

std::string trimmedRight(std::string line) {
    line.erase(line.find_last_not_of(' ') + 1);
    return line;
}

std::string padded(std::string const& text, std::size_t width, bool alignRight) {
    std::string const room(width - displayWidth(text), ' ');
    return alignRight ? room + text : text + room;
}

} // namespace

FittedTable::FittedTable(std::vector<TableColumn> columns) : _columns(std::move(columns)) {}

void FittedTable::addRow(std::vector<std::string> cells) {
    cells.resize(_columns.size());
    std::transform(cells.begin(), cells.end(), cells.begin(), oneLine);
    _rows.push_back(std::move(cells));
}

bool FittedTable::isEmpty() const {
    return _rows.empty();
}

std::string FittedTable::text(std::size_t width, std::string const& indent) const {
    std::size_t const indentWidth = displayWidth(indent);
    std::vector<std::size_t> const widths =
        _fittedWidths(width == 0 ? 0 : std::max<std::size_t>(width, indentWidth + 1) - indentWidth);
    std::vector<std::string> headers;
    std::transform(_columns.begin(), _columns.end(), std::back_inserter(headers),
                   [](TableColumn const& column) { return column.header; });
    std::string text;
    for (std::size_t row = 0; row <= _rows.size(); ++row) {
        std::string const line = indent + _line(row == 0 ? headers : _rows[row - 1], widths);
        text += (width == 0 ? line : cutToWidth(line, width)) + "\n";
    }
    return text;
}

std::vector<std::size_t> FittedTable::_naturalWidths() const {
    std::vector<std::size_t> widths;
    std::transform(_columns.begin(), _columns.end(), std::back_inserter(widths),
                   [](TableColumn const& column) { return displayWidth(column.header); });
    for (std::vector<std::string> const& row : _rows) {
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths[i] = std::max(widths[i], displayWidth(row[i]));
        }
    }
    return widths;
}

// The widest column that may narrow loses one column at a time, until the
// table fits or none can narrow further.
std::vector<std::size_t> FittedTable::_fittedWidths(std::size_t width) const {
    std::vector<std::size_t> widths = _naturalWidths();
    while (width != 0 && tableWidth(widths, 0) > width) {
        std::size_t widest = widths.size();
        for (std::size_t i = 0; i < widths.size(); ++i) {
            if (_columns[i].mayNarrow && widths[i] > gc_NarrowestColumn &&
                (widest == widths.size() || widths[i] > widths[widest])) {
                widest = i;
            }
        }
        if (widest == widths.size()) {
            break;
        }
        --widths[widest];
    }
    return widths;
}

std::string FittedTable::_line(std::vector<std::string> const& cells,
                               std::vector<std::size_t> const& widths) const {
    std::string line;
    for (std::size_t i = 0; i < cells.size(); ++i) {
        line += (i == 0 ? "" : gc_Gap) +
                padded(cutToWidth(cells[i], widths[i]), widths[i], _columns[i].alignRight);
    }
    return trimmedRight(line);
}

} // namespace history
