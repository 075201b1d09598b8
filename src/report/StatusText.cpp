#include "report/StatusText.h"

#include "utility/TextChecks.h"

#include <algorithm>

namespace report {

using util::isDigits;
using util::startsWith;

namespace {

constexpr char gc_SurveyedText[] = "Ok";
constexpr char gc_InactiveText[] = "Failed - Active Status < 3";
constexpr char gc_ChannelFailedPrefix[] = "RELAY Failed, rc = ";
constexpr char gc_ClientFailedPrefix[] = "Partition Failed, RcCmd = ";
constexpr char gc_FetchFailedSeed[] = "get result Failed, rc = ";
// The code is an unsigned 32-bit number: at most ten digits.
constexpr std::size_t gc_LongestCode = 10;

bool isCodeAfter(std::string const& text, std::string const& prefix) {
    return startsWith(text, prefix) && isDigits(text.substr(prefix.size()));
}

// A code of n digits followed by the seed's characters from n on.
bool isFetchFailure(std::string const& text) {
    std::string const seed = gc_FetchFailedSeed;
    std::size_t const digits = std::min(gc_LongestCode, text.size());
    for (std::size_t n = 1; n <= digits; ++n) {
        if (isDigits(text.substr(0, n)) && text.compare(n, std::string::npos, seed, n) == 0) {
            return true;
        }
    }
    return false;
}

} // namespace

std::optional<Outcome> outcomeOfStatusText(std::string const& statusText) {
    if (statusText == gc_SurveyedText) {
        return Outcome::Surveyed;
    }
    if (statusText == gc_InactiveText) {
        return Outcome::Inactive;
    }
    if (statusText == gc_InterruptedStatusText) {
        return Outcome::Interrupted;
    }
    if (statusText == gc_WorkerDiedStatusText) {
        return Outcome::WorkerDied;
    }
    if (isCodeAfter(statusText, gc_ChannelFailedPrefix)) {
        return Outcome::ChannelFailure;
    }
    if (isCodeAfter(statusText, gc_ClientFailedPrefix)) {
        return Outcome::ClientFailure;
    }
    if (isFetchFailure(statusText)) {
        return Outcome::FetchFailure;
    }
    return std::nullopt;
}

} // namespace report
