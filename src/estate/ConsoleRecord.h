#pragma once

#include <array>
#include <optional>
#include <string>

namespace estate {

// How the collection of one console ended, as the controller's records.json
// says it (docs/estate.md). Every text the programs show for a record comes
// from the table in ConsoleRecord.cpp.
enum class RecordKind {
    Unreachable,
    TimedOut,
    ToolError,
    Stale,
    Collected,
};

// One row of the record table.
struct RecordText {
    RecordKind kind;
    // The name records.json, estate.json and estate.csv use, e.g. "timed_out".
    char const* name;
    // What a person reads, e.g. "timed out".
    char const* label;
};

constexpr std::size_t gc_RecordKindCount = 5;

// Every record once, in the order the estate shows consoles: those that
// could not be collected first, the collected ones last.
std::array<RecordText, gc_RecordKindCount> const& recordTable();

RecordText const& textOf(RecordKind kind);
// The record of a name; nullopt for a name the table lacks.
std::optional<RecordKind> recordNamed(std::string const& name);

// One console of the inventory and how its collection ended.
struct ConsoleRecord {
    // The console's name in the Ansible inventory.
    std::string console;
    RecordKind kind = RecordKind::ToolError;
    // Ansible's message or the tool's; empty when there is none.
    std::string message;
    std::optional<long long> exitStatus;
    // How old the newest run was, for a stale console.
    std::optional<long long> ageSeconds;
    // The console's bundle folder, relative to the collect folder.
    std::optional<std::string> bundle;
};

} // namespace estate
