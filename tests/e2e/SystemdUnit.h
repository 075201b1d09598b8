#pragma once
// A systemd unit file read as systemd reads its settings: "[Section]"
// headers, "Key=Value" lines, comments starting with '#' or ';', blank
// lines. Line continuations are not read: the units this tests use none.

#include <map>
#include <string>
#include <utility>
#include <vector>

class SystemdUnit {
public:
    explicit SystemdUnit(std::string const& text);

    bool hasSection(std::string const& section) const;
    // Every value given to the key in the section, in file order.
    std::vector<std::string> values(std::string const& section, std::string const& key) const;
    // The one value of the key; empty when the key is not set. A key set
    // more than once fails the calling test.
    std::string value(std::string const& section, std::string const& key) const;
    // The values of a key that takes a list (ReadWritePaths=, say), split at
    // blanks, over all its lines.
    std::vector<std::string> words(std::string const& section, std::string const& key) const;

private:
    std::vector<std::string> _sections;
    std::map<std::pair<std::string, std::string>, std::vector<std::string>> _values;
};
