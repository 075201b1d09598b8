#include "utility/SystemError.h"

#include <system_error>
#include <utility>

namespace util {

namespace {

// The generic category's message is strerror's text without strerror's
// shared buffer, which another thread may overwrite.
std::string messageOf(std::string const& operation, std::string const& object, int errorNumber) {
    return "cannot " + operation + " " + object + ": " +
           std::generic_category().message(errorNumber);
}

} // namespace

SystemError::SystemError(std::string operation, std::string object, int errorNumber)
    : std::runtime_error(messageOf(operation, object, errorNumber)),
      _operation(std::move(operation)), _object(std::move(object)), _errorNumber(errorNumber) {}

std::string const& SystemError::operation() const {
    return _operation;
}

std::string const& SystemError::object() const {
    return _object;
}

int SystemError::errorNumber() const {
    return _errorNumber;
}

} // namespace util
