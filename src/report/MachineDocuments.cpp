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

} // namespace report
