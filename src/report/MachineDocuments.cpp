#include "report/MachineDocuments.h"

#include "utility/TextChecks.h"

#include <algorithm>
#include <tuple>

namespace report {

namespace {

// Partition IDs longer than this are taken as text: they would not fit a
// long long.
constexpr std::size_t gc_LongestNumericId = 18;

// Numeric IDs in numeric order, then the others in text order.
bool isBeforeInIdOrder(DocumentFile const& a, DocumentFile const& b) {
    auto const key = [](std::string const& id) {
        bool const numeric = id.size() <= gc_LongestNumericId && util::isDigits(id);
        return std::make_tuple(!numeric, numeric ? std::stoll(id) : 0LL, id);
    };
    return key(a.id) < key(b.id);
}

// Whether a document (a fetched one has no failure) fits a partition whose
// status text stands for statusOutcome.
bool fitsOutcome(std::optional<FailureReason> const& failure,
                 std::optional<Outcome> statusOutcome) {
    if (statusOutcome == Outcome::Surveyed) {
        return !failure;
    }
    if (!failure) {
        return false;
    }
    if (statusOutcome == Outcome::Interrupted || failure->isStoppedBySignal()) {
        return statusOutcome == Outcome::Interrupted && failure->isStoppedBySignal();
    }
    if (statusOutcome == Outcome::FetchFailure) {
        return failure->action == RemoteAction::GetFile;
    }
    if (statusOutcome == Outcome::ChannelFailure || statusOutcome == Outcome::ClientFailure) {
        return failure->action == RemoteAction::RunCommand;
    }
    return true;
}

// Whether a document fits a partition at all: an inactive one gets none.
bool fits(DocumentFile const& document, std::optional<Outcome> statusOutcome) {
    return statusOutcome != Outcome::Inactive && fitsOutcome(document.failure, statusOutcome);
}

// An empty HN is what a partition that reported no host name gives: it
// names no host either.
bool namesNoHost(DocumentFile const& document) {
    return !document.content.host || document.content.host->empty();
}

// The one of candidates (indices into documents) that fits statusOutcome;
// nullopt when none or several do.
std::optional<std::size_t> onlyFitting(std::vector<DocumentFile> const& documents,
                                       std::vector<std::size_t> const& candidates,
                                       std::optional<Outcome> statusOutcome) {
    std::optional<std::size_t> found;
    for (std::size_t const i : candidates) {
        if (fits(documents[i], statusOutcome)) {
            if (found) {
                return std::nullopt;
            }
            found = i;
        }
    }
    return found;
}

bool fitsOnlyOne(DocumentFile const& document,
                 std::vector<std::optional<Outcome>> const& statusOutcomes) {
    return std::count_if(statusOutcomes.begin(), statusOutcomes.end(),
                         [&](std::optional<Outcome> statusOutcome) {
                             return fits(document, statusOutcome);
                         }) == 1;
}

} // namespace

MachineDocuments::MachineDocuments(std::vector<DocumentFile> documents)
    : _documents(std::move(documents)), _taken(_documents.size(), false) {
    std::sort(_documents.begin(), _documents.end(), isBeforeInIdOrder);
    for (std::size_t i = 0; i < _documents.size(); ++i) {
        if (_documents[i].content.host) {
            _byHost[*_documents[i].content.host].push_back(i);
        }
    }
}

DocumentFile const* MachineDocuments::take(std::string const& host,
                                           std::optional<Outcome> statusOutcome) {
    auto const sameHost = _byHost.find(host);
    if (statusOutcome == Outcome::Inactive || sameHost == _byHost.end()) {
        return nullptr;
    }
    auto const& candidates = sameHost->second;
    auto const found = std::find_if(candidates.begin(), candidates.end(), [&](std::size_t i) {
        return !_taken[i] && fitsOutcome(_documents[i].failure, statusOutcome);
    });
    if (found == candidates.end()) {
        return nullptr;
    }
    _taken[*found] = true;
    return &_documents[*found];
}

std::vector<DocumentFile const*>
MachineDocuments::takeUnnamed(std::vector<std::optional<Outcome>> const& statusOutcomes) {
    std::vector<std::size_t> unnamed;
    for (std::size_t i = 0; i < _documents.size(); ++i) {
        if (!_taken[i] && namesNoHost(_documents[i])) {
            unnamed.push_back(i);
        }
    }
    // Every pairing is decided before any document is taken, so that it does
    // not depend on the order of the partitions.
    std::vector<std::optional<std::size_t>> found;
    for (std::optional<Outcome> const statusOutcome : statusOutcomes) {
        std::optional<std::size_t> const only = onlyFitting(_documents, unnamed, statusOutcome);
        bool const sure = only && fitsOnlyOne(_documents[*only], statusOutcomes);
        found.push_back(sure ? only : std::nullopt);
    }
    std::vector<DocumentFile const*> documents;
    for (std::optional<std::size_t> const i : found) {
        if (i) {
            _taken[*i] = true;
        }
        documents.push_back(i ? &_documents[*i] : nullptr);
    }
    return documents;
}

} // namespace report
