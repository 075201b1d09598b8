#pragma once

#include <stdexcept>
#include <string>

namespace history {

// Why the history database cannot be used: its what() is the reason alone
// ("the database is locked: another process has held it for more than
// 5 s"), and the program's edge says which file and what it was doing
// ("quorvex-survey: cannot record the run in FILE: reason").
class HistoryError : public std::runtime_error {
public:
    explicit HistoryError(std::string const& reason);
};

} // namespace history
