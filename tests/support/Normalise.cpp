#include "Normalise.h"

#include <functional>
#include <map>
#include <regex>

namespace QuorvexTest {

namespace {

constexpr char gc_SampleTimeStamp[] = "1700000000000";
constexpr char gc_TemporaryPrefix[] = "/tmp/ShellCommand.";
constexpr char gc_MaskedPart[] = "XXXXXX";

std::string _numberedName(std::size_t index) {
    if (index < 26) {
        return std::string(6, static_cast<char>('a' + index));
    }
    return "n" + std::to_string(index);
}

// text with every match of pattern replaced by what replacement makes of it.
std::string _replaceMatches(std::string const& text, std::regex const& pattern,
                            std::function<std::string(std::smatch const&)> const& replacement) {
    std::string replaced;
    auto rest = text.cbegin();
    for (std::sregex_iterator match(text.cbegin(), text.cend(), pattern), end; match != end;
         ++match) {
        replaced.append(rest, (*match)[0].first);
        replaced += replacement(*match);
        rest = (*match)[0].second;
    }
    replaced.append(rest, text.cend());
    return replaced;
}

} // namespace

std::string normaliseTemporaryNames(std::string const& text, TemporaryNames style) {
    static std::regex const temporaryName("/tmp/ShellCommand\\.([A-Za-z0-9]{6})");
    std::map<std::string, std::string> numbered;
    return _replaceMatches(text, temporaryName, [style, &numbered](std::smatch const& match) {
        if (style == TemporaryNames::Masked) {
            return std::string(gc_TemporaryPrefix) + gc_MaskedPart;
        }
        auto const placed = numbered.emplace(match[1].str(), _numberedName(numbered.size()));
        return gc_TemporaryPrefix + placed.first->second;
    });
}

std::string normaliseTimeStamps(std::string const& text, long first, long last) {
    static std::regex const timeStamp("timestamp=\"([0-9]{10})000\"");
    return _replaceMatches(text, timeStamp, [first, last](std::smatch const& match) {
        long const seconds = std::stol(match[1].str());
        bool const inRun = seconds >= first && seconds <= last;
        return inRun ? std::string("timestamp=\"") + gc_SampleTimeStamp + "\"" : match[0].str();
    });
}

} // namespace QuorvexTest
