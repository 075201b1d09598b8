#pragma once

#include <map>
#include <string>

namespace Utility {

// The command line as a map from option to value. An argument starting with
// "-" is an option; the next argument is its value unless that one starts
// with "-" too, and an option without a value gets "". Other arguments are
// ignored, and a repeated option keeps its first value.
class InputParameter {
public:
    InputParameter();
    InputParameter(unsigned int argc, char** argv);
    // Copies nothing: the copy is empty. No move operations are declared, so
    // moving copies too. Build the object in place and pass it by reference.
    // Kept for the class's callers: see docs/compatibility.md#input-parameter-copy
    InputParameter(InputParameter const& other);
    InputParameter& operator=(InputParameter const& other);
    ~InputParameter() = default;

    bool contains(std::string const& option) const;
    // The option's value; an absent option is added with an empty value, so
    // ask contains() first.
    std::string& operator[](std::string const& option);

private:
    std::map<std::string, std::string> _Parameters;
};

} // namespace Utility
