#pragma once

#include <stdexcept>
#include <string>

namespace history {

// Why the history command cannot answer, and the exit status that says so:
// what() is the whole message after the program's name ("history: cannot
// read FILE: No such file or directory").
class UnusableHistory : public std::runtime_error {
public:
    UnusableHistory(std::string const& message, int exitStatus);

    int exitStatus() const;

private:
    int _exitStatus;
};

} // namespace history
