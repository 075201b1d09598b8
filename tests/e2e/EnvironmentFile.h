#pragma once
// The variables of an environment file (EnvironmentFile= of a systemd unit)
// and a command line (ExecStart=) expanded with them, as systemd does it:
// "$NAME" alone as a word becomes the value's blank-separated words (none
// when it is empty or unset), "${NAME}" inside a word becomes the value as
// it is. The files this tests use assign values bare or in double quotes.

#include <map>
#include <string>
#include <vector>

class EnvironmentFile {
public:
    explicit EnvironmentFile(std::string const& text);

    std::map<std::string, std::string> const& variables() const { return _variables; }
    // Sets or replaces one variable, as a later assignment would.
    void set(std::string const& name, std::string const& value);

    // The words of commandLine, expanded with these variables.
    std::vector<std::string> expand(std::string const& commandLine) const;

private:
    std::string _value(std::string const& name) const;

    std::map<std::string, std::string> _variables;
};
