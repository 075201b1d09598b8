#include "report/PageSkeleton.h"

#include <algorithm>
#include <stdexcept>

namespace report {

namespace {

constexpr std::string_view gc_Opening = "<!--{{";
constexpr std::string_view gc_Closing = "}}-->";

// Where the placeholder that starts at opening ends, just past its closing.
std::size_t endOfPlaceholder(std::string_view skeleton, std::size_t opening) {
    std::size_t const closing = skeleton.find(gc_Closing, opening + gc_Opening.size());
    if (closing == std::string_view::npos) {
        throw std::invalid_argument("page skeleton: unclosed placeholder at byte " +
                                    std::to_string(opening));
    }
    return closing + gc_Closing.size();
}

std::string_view nameAt(std::string_view skeleton, std::size_t opening, std::size_t end) {
    std::size_t const nameStart = opening + gc_Opening.size();
    return skeleton.substr(nameStart, end - gc_Closing.size() - nameStart);
}

} // namespace

std::vector<std::string_view> placeholderNames(std::string_view skeleton) {
    std::vector<std::string_view> names;
    for (std::size_t opening = skeleton.find(gc_Opening); opening != std::string_view::npos;) {
        std::size_t const end = endOfPlaceholder(skeleton, opening);
        names.push_back(nameAt(skeleton, opening, end));
        opening = skeleton.find(gc_Opening, end);
    }
    return names;
}

void fillSkeleton(std::string& page, std::string_view skeleton,
                  std::vector<Placeholder> const& placeholders) {
    std::size_t copied = 0;
    for (std::size_t opening = skeleton.find(gc_Opening); opening != std::string_view::npos;) {
        std::size_t const end = endOfPlaceholder(skeleton, opening);
        std::string_view const name = nameAt(skeleton, opening, end);
        auto const found =
            std::find_if(placeholders.begin(), placeholders.end(),
                         [&](Placeholder const& placeholder) { return placeholder.name == name; });
        if (found == placeholders.end()) {
            throw std::invalid_argument("page skeleton: nothing fills the placeholder '" +
                                        std::string(name) + "'");
        }
        page.append(skeleton.substr(copied, opening - copied));
        found->fill(page);
        copied = end;
        opening = skeleton.find(gc_Opening, end);
    }
    page.append(skeleton.substr(copied));
}

} // namespace report
