#pragma once

#include "report/FailureReason.h"
#include "report/Outcome.h"
#include "report/VpdDocument.h"

#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace report {

// One VPD document of a machine, read once: a large console has thousands.
struct DocumentFile {
    // The partition text of its name (machine identity, "-", partition ID).
    std::string partitionText;
    std::string id;
    VpdDocument content;
    // The content's reason, for a default document.
    std::optional<FailureReason> failure;
};

// One machine's VPD documents, each handed to at most one of the partitions
// its status file lists. The status file names no document: a partition
// gets the first document not yet taken, in the order of their partition IDs,
// of the same host whose kind fits its status text. A document that names no
// host (no HN, or an empty one) still carries its partition's ID in its file
// name; it goes to a partition left without one only when neither can be
// mistaken for another (see takeUnnamed).
class MachineDocuments {
public:
    explicit MachineDocuments(std::vector<DocumentFile> documents);

    // The document of a partition of host whose status text stands for
    // statusOutcome (nullopt for a text the survey never writes): a fetched
    // one for a surveyed partition, a default one for a failure, one a signal
    // stopped for an interrupted partition, none for an inactive partition,
    // which gets no document. The document is taken: nullptr when none is
    // left.
    DocumentFile const* take(std::string const& host, std::optional<Outcome> statusOutcome);

    // The documents of the partitions take left without one, given by their
    // status outcomes, in the same order: a partition gets the document not
    // yet taken that names no host when it is the only such document whose
    // kind fits the partition and the partition is the only one given here
    // that the document fits. Any other partition gets nullptr: two alike
    // partitions and their two documents could be paired either way, and a
    // wrong ID is worse than none. The documents given are taken.
    std::vector<DocumentFile const*>
    takeUnnamed(std::vector<std::optional<Outcome>> const& statusOutcomes);

private:
    std::vector<DocumentFile> _documents;
    std::vector<bool> _taken;
    // Each host's documents, as indices into _documents in ID order.
    std::unordered_map<std::string, std::vector<std::size_t>> _byHost;
};

} // namespace report
