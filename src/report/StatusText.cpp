#include "report/StatusText.h"

#include "report/TextChecks.h"

#include <algorithm>

namespace report {

namespace {

constexpr char surveyedText[] = "Ok";
constexpr char inactiveText[] = "Failed - Active Status < 3";
constexpr char channelFailedPrefix[] = "RELAY Failed, rc = ";
constexpr char clientFailedPrefix[] = "Partition Failed, RcCmd = ";
constexpr char fetchFailedSeed[] = "get result Failed, rc = ";
// The code is an unsigned 32-bit number: at most ten digits.
constexpr std::size_t longestCode = 10;

bool isCodeAfter(std::string const& text, std::string const& prefix) {
    return startsWith(text, prefix) && isDigits(text.substr(prefix.size()));
}

// A code of n digits followed by the seed's characters from n on.
bool isFetchFailure(std::string const& text) {
    std::string const seed = fetchFailedSeed;
    std::size_t const digits = std::min(longestCode, text.size());
    for (std::size_t n = 1; n <= digits; ++n) {
        if (isDigits(text.substr(0, n)) && text.compare(n, std::string::npos, seed, n) == 0) {
            return true;
        }
    }
    return false;
}

} // namespace

std::optional<Outcome> outcomeOfStatusText(std::string const& statusText) {
    if (statusText == surveyedText) {
        return Outcome::Surveyed;
    }
    if (statusText == inactiveText) {
        return Outcome::Inactive;
    }
    if (statusText == gc_InterruptedStatusText) {
        return Outcome::Interrupted;
    }
    if (isCodeAfter(statusText, channelFailedPrefix)) {
        return Outcome::ChannelFailure;
    }
    if (isCodeAfter(statusText, clientFailedPrefix)) {
        return Outcome::ClientFailure;
    }
    if (isFetchFailure(statusText)) {
        return Outcome::FetchFailure;
    }
    return std::nullopt;
}

} // namespace report
