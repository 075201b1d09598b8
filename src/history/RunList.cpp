#include "history/RunList.h"

#include "history/ColumnValue.h"
#include "history/DisplayText.h"
#include "history/FittedTable.h"

#include <SQLiteCpp/Statement.h>
#include <cstdint>

#include <iterator>

namespace history {

namespace {

constexpr int gc_RunColumnCount = static_cast<int>(std::size(gc_RunKeys));

// The newest runs, then put oldest first.
SQLite::Statement selectRuns(SQLite::Database& database, RunSelection const& selection) {
    SQLite::Statement query(database, std::string("SELECT * FROM (SELECT ") + gc_RunColumns +
                                          " FROM runs r WHERE ?1 IS NULL OR r.console = ?1"
                                          " ORDER BY r.id DESC LIMIT ?2) ORDER BY 1");
    if (selection.console) {
        query.bind(1, *selection.console);
    }
    query.bind(2,
               selection.last == 0 ? std::int64_t{-1} : static_cast<std::int64_t>(selection.last));
    return query;
}

FittedTable runTable() {
    // Short headings, so that a run fits in 80 columns (docs/history.md
    // says what each means).
    return FittedTable({{"Run", true},
                        {"Console", false, true},
                        {"Started"},
                        {"Took", true},
                        {"Exit", true},
                        {"Surveyed", true},
                        {"Failed", true},
                        {"New", true},
                        {"Recov", true},
                        {"Inv", true}});
}

// The exit status, and the signal that stopped the run beside it.
std::string exitText(SQLite::Statement const& query) {
    std::string text = query.getColumn(5).isNull() ? "-" : textValue(query.getColumn(5));
    return query.getColumn(7).isNull() ? text : text + " " + textValue(query.getColumn(7));
}

std::vector<std::string> runRow(SQLite::Statement const& query) {
    return {textValue(query.getColumn(0)),
            textValue(query.getColumn(1)),
            shownTime(textValue(query.getColumn(2))),
            durationText(numberValue(query.getColumn(4))),
            exitText(query),
            textValue(query.getColumn(9)) + "/" + textValue(query.getColumn(8)),
            textValue(query.getColumn(10)),
            textValue(query.getColumn(11)),
            textValue(query.getColumn(12)),
            textValue(query.getColumn(13))};
}

} // namespace

std::string runListText(SQLite::Database& database, RunSelection const& selection,
                        std::size_t width) {
    SQLite::Statement query = selectRuns(database, selection);
    FittedTable table = runTable();
    while (query.executeStep()) {
        table.addRow(runRow(query));
    }
    if (table.isEmpty()) {
        return selection.console ? "No run of " + *selection.console + " recorded.\n"
                                 : std::string("No run recorded.\n");
    }
    return table.text(width);
}

nlohmann::ordered_json runListJson(SQLite::Database& database, RunSelection const& selection) {
    SQLite::Statement query = selectRuns(database, selection);
    nlohmann::ordered_json runs = nlohmann::ordered_json::array();
    while (query.executeStep()) {
        nlohmann::ordered_json run = nlohmann::ordered_json::object();
        for (int i = 0; i < gc_RunColumnCount; ++i) {
            run[gc_RunKeys[i]] = jsonValue(query.getColumn(i));
        }
        runs.push_back(std::move(run));
    }
    return {{"runs", runs}};
}

} // namespace history
