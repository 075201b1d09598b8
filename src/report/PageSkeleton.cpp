#include "report/PageSkeleton.h"

#include <algorithm>
#include <functional>
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

// Calls visit with where each placeholder starts and ends and its name, in
// the order they appear.
void forEachPlaceholder(
    std::string_view skeleton,
    std::function<void(std::size_t, std::size_t, std::string_view)> const& visit) {
    for (std::size_t opening = skeleton.find(gc_Opening); opening != std::string_view::npos;) {
        std::size_t const end = endOfPlaceholder(skeleton, opening);
        visit(opening, end, nameAt(skeleton, opening, end));
        opening = skeleton.find(gc_Opening, end);
    }
}

} // namespace

std::vector<std::string_view> placeholderNames(std::string_view skeleton) {
    std::vector<std::string_view> names;
    forEachPlaceholder(
        skeleton, [&](std::size_t, std::size_t, std::string_view name) { names.push_back(name); });
    return names;
}

void fillSkeleton(std::string& page, std::string_view skeleton,
                  std::vector<Placeholder> const& placeholders) {
    std::size_t copied = 0;
    forEachPlaceholder(skeleton, [&](std::size_t opening, std::size_t end, std::string_view name) {
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
    });
    page.append(skeleton.substr(copied));
}

Placeholder textPlaceholder(std::string_view name, std::string text) {
    return {name, [text = std::move(text)](std::string& page) { page += text; }};
}

} // namespace report
