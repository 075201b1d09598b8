#include "estate/ConsoleRecord.h"

#include <algorithm>

namespace estate {

std::array<RecordText, gc_RecordKindCount> const& recordTable() {
    static std::array<RecordText, gc_RecordKindCount> const table = {{
        {RecordKind::Unreachable, "unreachable", "unreachable"},
        {RecordKind::TimedOut, "timed_out", "timed out"},
        {RecordKind::ToolError, "tool_error", "tool error"},
        {RecordKind::Stale, "stale", "stale"},
        {RecordKind::Collected, "collected", "collected"},
    }};
    return table;
}

RecordText const& textOf(RecordKind kind) {
    auto const& table = recordTable();
    return *std::find_if(table.begin(), table.end(),
                         [kind](RecordText const& row) { return row.kind == kind; });
}

std::optional<RecordKind> recordNamed(std::string const& name) {
    auto const& table = recordTable();
    auto const row = std::find_if(table.begin(), table.end(),
                                  [&name](RecordText const& text) { return name == text.name; });
    if (row == table.end()) {
        return std::nullopt;
    }
    return row->kind;
}

} // namespace estate
