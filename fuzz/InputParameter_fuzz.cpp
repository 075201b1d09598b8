// The command-line map from an arbitrary argument vector. Input: the
// arguments, program name first, each ended by a NUL byte (the last one may
// end with the input).

#include "Fuzz_Utility.h"

#include "survey/InputParameter.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <map>
#include <string>
#include <vector>

namespace {

bool u_is_Option(std::string const& argument) {
    return !argument.empty() && argument[0] == '-';
}

// Options from the second argument on; an option takes the next argument as
// its value unless that is an option too; the first occurrence wins.
std::map<std::string, std::string> u_expect_Parameters(std::vector<std::string> const& arguments) {
    std::map<std::string, std::string> parameters;
    for (std::size_t i = 1; i < arguments.size(); ++i) {
        if (!u_is_Option(arguments[i])) {
            continue;
        }
        bool const hasValue = i + 1 < arguments.size() && !u_is_Option(arguments[i + 1]);
        std::string const value = hasValue ? arguments[i + 1] : std::string();
        parameters.insert({arguments[i], value});
        i += hasValue ? 1 : 0;
    }
    return parameters;
}

std::vector<std::string> u_split_Arguments(std::string const& input) {
    std::vector<std::string> arguments;
    std::string::size_type start = 0;
    while (start < input.size()) {
        std::string::size_type const end = input.find('\0', start);
        arguments.push_back(input.substr(start, end - start));
        start = end == std::string::npos ? input.size() : end + 1;
    }
    return arguments;
}

// Not const: the map's look-up adds an option it does not hold.
// cppcheck-suppress constParameter
void u_check(Utility::InputParameter& parameters, std::vector<std::string> const& arguments,
             std::string const& input) {
    std::map<std::string, std::string> const expected = u_expect_Parameters(arguments);
    for (std::string const& argument : arguments) {
        auto const found = expected.find(argument);
        Fuzz_Utility::u_require(parameters.contains(argument) == (found != expected.end()),
                                "exactly the options are keys", argument);
        if (found != expected.end()) {
            Fuzz_Utility::u_require(parameters[argument] == found->second,
                                    "an option's value is the argument after its first occurrence",
                                    input);
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    std::string const input(reinterpret_cast<char const*>(data), size);
    std::vector<std::string> const arguments = u_split_Arguments(input);
    std::vector<std::vector<char>> storage;
    std::vector<char*> argv;
    for (std::string const& argument : arguments) {
        storage.emplace_back(argument.begin(), argument.end());
        storage.back().push_back('\0');
    }
    argv.reserve(storage.size() + 1);
    std::transform(storage.begin(), storage.end(), std::back_inserter(argv),
                   [](std::vector<char>& argument) { return argument.data(); });
    argv.push_back(nullptr);

    Utility::InputParameter parameters(static_cast<unsigned int>(arguments.size()), argv.data());
    u_check(parameters, arguments, input);

    Utility::InputParameter const copy(parameters);
    Utility::InputParameter const withoutVector(static_cast<unsigned int>(arguments.size()),
                                                nullptr);
    for (std::string const& argument : arguments) {
        Fuzz_Utility::u_require(!copy.contains(argument), "a copy is deliberately empty", argument);
        Fuzz_Utility::u_require(!withoutVector.contains(argument),
                                "without an argument vector the map is empty", argument);
    }
    Utility::InputParameter assigned;
    assigned = parameters;
    u_check(assigned, arguments, input);
    return 0;
}
