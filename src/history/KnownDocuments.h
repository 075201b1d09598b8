#pragma once

#include "history/RunPair.h"

#include <SQLiteCpp/Database.h>

#include <optional>
#include <string>
#include <unordered_map>

namespace history {

// The contents the history holds already that a run's documents are likely
// to repeat: those of each machine's previous record, with what reading them
// gave. A document whose hash is known is neither read again nor looked up
// in the documents table: its partition result takes its inventory from
// here.
class KnownDocuments {
public:
    struct Known {
        std::string inventory; // read, unreadable or default
        std::optional<std::string> problem;
    };

    // The contents of the machines' previous records of the run.
    static KnownDocuments ofPreviousRecords(SQLite::Database& db, RunPair const& runs);

    void add(std::string const& hash, Known known);
    // Null when the content is not known.
    Known const* find(std::string const& hash) const;

private:
    std::unordered_map<std::string, Known> _byHash;
};

} // namespace history
