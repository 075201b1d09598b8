#include "EnvironmentFile.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

std::vector<std::string> u_words(std::string const& text) {
    std::vector<std::string> words;
    std::istringstream stream(text);
    for (std::string word; stream >> word;) {
        words.push_back(word);
    }
    return words;
}

// A value without its double quotes and with their escapes undone.
std::string u_unquoted(std::string const& value) {
    if (value.size() < 2 || value.front() != '"' || value.back() != '"') {
        return value;
    }
    std::string result;
    for (std::size_t i = 1; i + 1 < value.size(); ++i) {
        if (value[i] == '\\' && i + 2 < value.size()) {
            ++i;
        }
        result += value[i];
    }
    return result;
}

} // namespace

EnvironmentFile::EnvironmentFile(std::string const& text) {
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        if (line.empty() || line[0] == '#' || line[0] == ';') {
            continue;
        }
        std::size_t const equals = line.find('=');
        if (equals == std::string::npos) {
            ADD_FAILURE() << "an environment file line without '=': " << line;
            continue;
        }
        set(line.substr(0, equals), u_unquoted(line.substr(equals + 1)));
    }
}

void EnvironmentFile::set(std::string const& name, std::string const& value) {
    _variables[name] = value;
}

std::string EnvironmentFile::_value(std::string const& name) const {
    auto const found = _variables.find(name);
    return found == _variables.end() ? "" : found->second;
}

std::vector<std::string> EnvironmentFile::expand(std::string const& commandLine) const {
    std::vector<std::string> expanded;
    for (std::string word : u_words(commandLine)) {
        if (word.size() > 1 && word[0] == '$' && word[1] != '{') {
            std::vector<std::string> const parts = u_words(_value(word.substr(1)));
            expanded.insert(expanded.end(), parts.begin(), parts.end());
            continue;
        }
        for (std::size_t start = word.find("${"); start != std::string::npos;
             start = word.find("${", start)) {
            std::size_t const end = word.find('}', start);
            std::string const value = _value(word.substr(start + 2, end - start - 2));
            word.replace(start, end - start + 1, value);
            start += value.size();
        }
        expanded.push_back(word);
    }
    return expanded;
}
