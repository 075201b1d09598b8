#include "history/RunPair.h"

#include <cstdint>

namespace history {

void bindRuns(SQLite::Statement& statement, RunPair const& runs) {
    if (int const index = statement.getIndex(":run"); index != 0) {
        statement.bind(index, static_cast<std::int64_t>(runs.run));
    }
    if (int const index = statement.getIndex(":previous"); index != 0 && runs.previous) {
        statement.bind(index, static_cast<std::int64_t>(*runs.previous));
    }
    if (int const index = statement.getIndex(":console"); index != 0) {
        statement.bind(index, runs.console);
    }
}

void executeForRuns(SQLite::Database& db, std::string const& sql, RunPair const& runs) {
    SQLite::Statement statement(db, sql);
    bindRuns(statement, runs);
    statement.exec();
}

} // namespace history
