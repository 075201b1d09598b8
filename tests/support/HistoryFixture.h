#pragma once
// A history database for the tests of the history command: the schema
// file's tables, marked as the store marks the files it makes, then the
// rows a test adds.

#include "TemporaryFiles.h"

#include <SQLiteCpp/Database.h>

#include <optional>
#include <string>
#include <vector>

namespace QuorvexTest {

using Text = std::optional<std::string>;
using Number = std::optional<long long>;

class HistoryFixture {
public:
    // Creates the database at path from src/history/migrations/0001-history.sql,
    // with the store's application id and schema version 1.
    explicit HistoryFixture(std::string const& path);

    SQLite::Database& database();
    // A run of console; started_unix is read from started. Returns its id.
    long long addRun(std::string const& console, std::string const& started,
                     std::string const& ended, int partitions, int surveyed, int failed,
                     Number exitStatus = 0, Text const& interrupted = {});
    // Adds the partition's result, and its machine's when the run has none.
    void addPartition(long long run, std::string const& machine, std::string const& partition,
                      std::string const& outcome = "surveyed", Text const& reason = {},
                      Number failingSinceRun = {}, Number runsFailing = {},
                      std::string const& inventory = "read");
    void addPartitionEvent(long long run, std::string const& kind, std::string const& machine,
                           std::string const& partition, Text const& outcome = {},
                           Text const& reason = {}, Number failingSinceRun = {},
                           Number runsFailing = {});
    void addMachineEvent(long long run, std::string const& kind, std::string const& machine,
                         Text const& reason = {});
    // old and new: the serial numbers of "replaced", the values of
    // "property_changed".
    void addComponentEvent(long long run, std::string const& kind, std::string const& machine,
                           std::string const& partition, std::string const& component,
                           std::string const& name, Text const& property = {},
                           Text const& oldValue = {}, Text const& newValue = {});

private:
    // The columns of the events table from partition on, in its order.
    void _addEvent(long long run, std::string const& scope, std::string const& kind,
                   std::string const& machine, std::vector<Text> const& texts,
                   Number failingSinceRun, Number runsFailing);

    SQLite::Database _database;
};

// The example history several tests read: console cons-a's runs 1, 2, 4
// and 5 and console cons-b's run 3, over machines gc_HistoryMachine and
// gc_HistoryOtherMachine. Run 2: lpar2 newly failing (timed out), lpar1's
// Ethernet adapter replaced. Run 4 (stopped by SIGTERM): lpar2 still
// failing, lpar3 gone, lpar4 new, a firmware level changed, the other
// machine new and its listing failed. Run 5: lpar2 recovered, the listing
// recovered, an adapter added to lpar4 and one removed from lpar1.
void addExampleRuns(HistoryFixture& history);

// The example history in a temporary folder of its own.
class ExampleHistory {
public:
    ExampleHistory();

    std::string const& path() const;
    SQLite::Database& database();

private:
    TemporaryDirectory _folder;
    std::string _path;
    HistoryFixture _history;
};

inline constexpr char gc_HistoryMachine[] = "8233-E8B_10ABCDE";
inline constexpr char gc_HistoryOtherMachine[] = "9119-MHE_21ABCDE";

} // namespace QuorvexTest
