#include "SystemdUnit.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

namespace {

std::string u_trim(std::string const& text) {
    std::size_t const first = text.find_first_not_of(" \t");
    if (first == std::string::npos) {
        return "";
    }
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

} // namespace

SystemdUnit::SystemdUnit(std::string const& text) {
    std::istringstream lines(text);
    std::string section;
    for (std::string line; std::getline(lines, line);) {
        line = u_trim(line);
        if (line.empty() || line[0] == '#' || line[0] == ';') {
            continue;
        }
        if (line.front() == '[' && line.back() == ']') {
            section = line.substr(1, line.size() - 2);
            _sections.push_back(section);
            continue;
        }
        std::size_t const equals = line.find('=');
        if (equals == std::string::npos) {
            ADD_FAILURE() << "a unit line without '=': " << line;
            continue;
        }
        _values[{section, u_trim(line.substr(0, equals))}].push_back(
            u_trim(line.substr(equals + 1)));
    }
}

bool SystemdUnit::hasSection(std::string const& section) const {
    return std::find(_sections.begin(), _sections.end(), section) != _sections.end();
}

std::vector<std::string> SystemdUnit::values(std::string const& section,
                                             std::string const& key) const {
    auto const found = _values.find({section, key});
    return found == _values.end() ? std::vector<std::string>{} : found->second;
}

std::string SystemdUnit::value(std::string const& section, std::string const& key) const {
    std::vector<std::string> const all = values(section, key);
    EXPECT_LE(all.size(), 1U) << "[" << section << "] " << key << " is set more than once";
    return all.empty() ? "" : all.back();
}

std::vector<std::string> SystemdUnit::words(std::string const& section,
                                            std::string const& key) const {
    std::vector<std::string> result;
    for (std::string const& line : values(section, key)) {
        std::istringstream stream(line);
        for (std::string word; stream >> word;) {
            result.push_back(word);
        }
    }
    return result;
}
