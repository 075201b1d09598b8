#include "utility/WholeNumber.h"

#include <charconv>

namespace util {

std::optional<unsigned long long>
wholeNumberWithin(std::string const& text, unsigned long long lowest, unsigned long long highest) {
    unsigned long long value = 0;
    char const* const end = text.data() + text.size();
    auto const [stop, failure] = std::from_chars(text.data(), end, value);
    if (text.empty() || failure != std::errc{} || stop != end || value < lowest ||
        value > highest) {
        return std::nullopt;
    }
    return value;
}

} // namespace util
