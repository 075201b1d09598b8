#pragma once

#include "history/KnownDocuments.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace history {

// What one partition's document gave: its content hash and, when the
// history does not hold that content yet, its reading; or why the file
// could not be read.
struct DocumentIngestResult {
    // The reading of a document the history does not hold yet.
    struct Reading {
        std::string inventory; // read, unreadable or default
        std::optional<std::string> problem;
        std::string components; // encodeComponents()
    };

    std::string hash;               // empty when the file could not be read
    std::string readFailure;        // "cannot read PATH: <errno text>"
    std::optional<Reading> reading; // none for a content already held
    // What reading a content already held gave before; null otherwise.
    KnownDocuments::Known const* known = nullptr;
};

// Reads the documents of a run: each file's bytes, their content hash, and
// for a content not yet held, its components. Files are read on several
// threads when there are many (a run of thousands of partitions), and each
// result is handed to the caller on the calling thread as it comes, so that
// the caller writes it to the database while the next ones are read and no
// more than a bounded number of readings are held at once.
class DocumentIngest {
public:
    using Delivery = std::function<void(std::size_t index, DocumentIngestResult&& result)>;

    // known: contents held already, which are not read again.
    DocumentIngest(KnownDocuments const& known, unsigned threads);

    // Calls deliver once per path, with the path's index, in any order.
    // An exception of a reading thread or of deliver ends the whole run and
    // is thrown here once every thread has stopped.
    void run(std::vector<std::string> const& paths, Delivery const& deliver) const;

    // One document, on the calling thread.
    DocumentIngestResult ingest(std::string const& path) const;

private:
    KnownDocuments const& _known;
    unsigned _threads;
};

} // namespace history
