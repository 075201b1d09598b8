#pragma once

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// How the command line names an option that it does not know, and which
// known option the person most likely meant.

// The option's name as typed, without an attached value: "--sumary" of
// "--sumary=x.json".
std::string typedOptionName(std::string const& argument);

// The known long option meant by typed: the only one typed begins, or else
// the one nearest in spelling when at most two letters differ (the first of
// equally near ones). None when nothing is that close.
std::optional<std::string> closestOption(std::string const& typed,
                                         std::vector<std::string> const& knownOptions);

// Letters inserted, removed or replaced to turn one word into the other.
std::size_t editDistance(std::string const& from, std::string const& to);

} // namespace fleet
