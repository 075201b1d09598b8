#include "survey/InputParameter.h"

namespace Utility {

namespace {

bool _u_is_Option(char const* argument) {
    return argument != nullptr && argument[0] == '-';
}

} // namespace

InputParameter::InputParameter() : _Parameters() {}

InputParameter::InputParameter(unsigned int argc, char** argv) : _Parameters() {
    if (argc == 0 || argv == nullptr) {
        return;
    }
    for (unsigned int i = 1; i < argc; ++i) {
        if (!_u_is_Option(argv[i])) {
            continue;
        }
        std::string const option = argv[i];
        std::string value;
        if (i + 1 < argc && argv[i + 1] != nullptr && !_u_is_Option(argv[i + 1])) {
            value = argv[++i];
        }
        // insert() keeps the value already there: the first occurrence wins.
        // Kept for the console's scripts: see docs/compatibility.md#command-line
        _Parameters.insert({option, value});
    }
}

// The copy is empty. Kept for the class's callers: see docs/compatibility.md#input-parameter-copy
InputParameter::InputParameter(InputParameter const&) : _Parameters() {}

InputParameter& InputParameter::operator=(InputParameter const& other) {
    if (this != &other) {
        _Parameters = other._Parameters;
    }
    return *this;
}

bool InputParameter::contains(std::string const& option) const {
    return _Parameters.count(option) != 0;
}

std::string& InputParameter::operator[](std::string const& option) {
    return _Parameters[option];
}

} // namespace Utility
