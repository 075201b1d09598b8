#pragma once

#include <stdexcept>
#include <string>

namespace util {

// A failure of the system (a file, a folder, a process): what was tried, on
// which path or object, and the errno it failed with. what() reads
// "cannot write /var/adm/x: No space left on device", so that the program's
// edge prints it as it is, after the program's name.
class SystemError : public std::runtime_error {
public:
    // operation: a verb as the message says it ("write", "read", "rename",
    // "create folder"); object: the path or what else was acted on.
    SystemError(std::string operation, std::string object, int errorNumber);

    std::string const& operation() const;
    std::string const& object() const;
    int errorNumber() const;

private:
    std::string _operation;
    std::string _object;
    int _errorNumber;
};

} // namespace util
