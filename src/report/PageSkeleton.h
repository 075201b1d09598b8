#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace report {

// Filling in a page skeleton: an HTML file whose data are left out, each
// place for them marked with an HTML comment <!--{{name}}-->, which editors
// and HTML checkers take as an ordinary comment.

// One placeholder's name and what appends its markup to the page.
struct Placeholder {
    std::string_view name;
    std::function<void(std::string& page)> fill;
};

// The names of the skeleton's placeholders in order, repeated ones repeated.
std::vector<std::string_view> placeholderNames(std::string_view skeleton);

// A placeholder filled with a text that is ready as it is.
Placeholder textPlaceholder(std::string_view name, std::string text);

// Appends the skeleton to page with every placeholder replaced by what its
// filler appends (a name used twice is filled twice). A placeholder without
// a filler, or one left unclosed, is a std::invalid_argument naming it: the
// skeleton and the program that fills it disagree.
void fillSkeleton(std::string& page, std::string_view skeleton,
                  std::vector<Placeholder> const& placeholders);

} // namespace report
