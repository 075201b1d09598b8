#pragma once
// A history database for tests, made from the schema's migration files and
// filled by plain SQL, so that a reader's test says exactly which rows it
// reads. Library quorvex_history_seed (only tests of history readers link
// SQLite).

#include <optional>
#include <string>

namespace QuorvexTest {

class HistorySeed {
public:
    // Creates the database at path from every file of
    // src/history/migrations in order, at their schema version.
    explicit HistorySeed(std::string path);

    std::string const& path() const;

    // Runs statements as they are; throws SQLite::Exception with SQLite's
    // message when one fails.
    void execute(std::string const& sql) const;

    // Adds a run of console started at started (ISO 8601) and returns its id.
    long long addRun(std::string const& console, std::string const& started) const;

    // Adds the machine's row to run, as a run that listed it has (once).
    void addMachine(long long run, std::string const& machine) const;

    // Adds a partition's row to run, and its machine's; the streak and the
    // last survey as the recording computed them.
    struct PartitionRow {
        std::string machine;
        std::string partition;
        std::string outcome;
        std::optional<long long> failingSinceRun;
        std::optional<long long> runsFailing;
        std::optional<long long> lastSurveyedRun;
    };
    void addPartition(long long run, PartitionRow const& row) const;

private:
    std::string _path;
};

} // namespace QuorvexTest
