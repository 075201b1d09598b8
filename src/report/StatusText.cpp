#include "report/StatusText.h"

#include "utility/TextChecks.h"

#include <algorithm>

namespace report {

using util::isDigits;
using util::startsWith;

namespace {

constexpr char surveyedText[] = "Ok";
constexpr char inactiveText[] = "Failed - Active Status < 3";
constexpr char interruptedText[] = "Interrupted - not surveyed";
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

std::optional<std::string> outcomeOfStatusText(std::string const& statusText) {
    if (statusText == surveyedText) {
        return "surveyed";
    }
    if (statusText == inactiveText) {
        return "inactive";
    }
    if (statusText == interruptedText) {
        return "interrupted";
    }
    if (isCodeAfter(statusText, channelFailedPrefix)) {
        return "channel_failure";
    }
    if (isCodeAfter(statusText, clientFailedPrefix)) {
        return "client_failure";
    }
    if (isFetchFailure(statusText)) {
        return "fetch_failure";
    }
    return std::nullopt;
}

} // namespace report
