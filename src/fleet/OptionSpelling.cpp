#include "fleet/OptionSpelling.h"

#include "utility/TextChecks.h"

#include <algorithm>
#include <numeric>

namespace fleet {

namespace {

// A typo further than this from every option is not guessed at.
constexpr std::size_t gc_FarthestSuggestion = 2;

std::optional<std::string> onlyOneStartingWith(std::string const& typed,
                                               std::vector<std::string> const& knownOptions) {
    std::optional<std::string> found;
    for (std::string const& option : knownOptions) {
        if (util::startsWith(option, typed)) {
            if (found) {
                return std::nullopt;
            }
            found = option;
        }
    }
    return found;
}

} // namespace

std::string typedOptionName(std::string const& argument) {
    if (!util::startsWith(argument, "--")) {
        return argument;
    }
    return argument.substr(0, argument.find('='));
}

std::optional<std::string> closestOption(std::string const& typed,
                                         std::vector<std::string> const& knownOptions) {
    // "--" alone or a short option: too little to guess from.
    if (typed.size() < 3 || !util::startsWith(typed, "--")) {
        return std::nullopt;
    }
    if (std::optional<std::string> started = onlyOneStartingWith(typed, knownOptions)) {
        return started;
    }
    std::optional<std::string> nearest;
    std::size_t nearestDistance = gc_FarthestSuggestion + 1;
    for (std::string const& option : knownOptions) {
        std::size_t const distance = editDistance(typed, option);
        if (distance < nearestDistance) {
            nearest = option;
            nearestDistance = distance;
        }
    }
    return nearest;
}

std::size_t editDistance(std::string const& from, std::string const& to) {
    // One row of the distance table at a time: row[j] is the distance of the
    // first i letters of from to the first j letters of to.
    std::vector<std::size_t> row(to.size() + 1);
    std::iota(row.begin(), row.end(), std::size_t{0});
    for (std::size_t i = 1; i <= from.size(); ++i) {
        std::size_t diagonal = row[0];
        row[0] = i;
        for (std::size_t j = 1; j <= to.size(); ++j) {
            std::size_t const above = row[j];
            std::size_t const replaced = diagonal + (from[i - 1] == to[j - 1] ? 0 : 1);
            row[j] = std::min({above + 1, row[j - 1] + 1, replaced});
            diagonal = above;
        }
    }
    return row[to.size()];
}

} // namespace fleet
