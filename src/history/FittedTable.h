#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace history {

// One column of a FittedTable.
struct TableColumn {
    std::string header;
    bool alignRight = false;
    // A column of names or reasons, which is narrowed (its values cut with
    // "…") before any line is cut, when the table is wider than the terminal.
    bool mayNarrow = false;
};

// A table of text for the terminal: a header row, then one row per record,
// columns two spaces apart, no space at the end of a line. Wider than the
// terminal, it narrows the columns that may narrow, widest first, and then
// cuts each line that is still too long: a row is never wrapped.
class FittedTable {
public:
    explicit FittedTable(std::vector<TableColumn> columns);

    // One cell per column; control characters become spaces.
    void addRow(std::vector<std::string> cells);
    bool isEmpty() const;

    // The table's lines, each after indent, in width columns at most; width
    // 0 for no limit (standard output is not a terminal).
    std::string text(std::size_t width, std::string const& indent = "") const;

private:
    std::vector<std::size_t> _naturalWidths() const;
    std::vector<std::size_t> _fittedWidths(std::size_t width) const;
    std::string _line(std::vector<std::string> const& cells,
                      std::vector<std::size_t> const& widths) const;

    std::vector<TableColumn> _columns;
    std::vector<std::vector<std::string>> _rows;
};

} // namespace history
