// The managed machine list, fed with arbitrary output of the console's
// machine listing tool through the real constructor.

#include "Fuzz_Console.h"
#include "Fuzz_Utility.h"

#include "pylon/ListOf_Machines.h"
#include "pylon/Machine.h"
#include "system/MTMS.h"
#include "utility/Trace.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace {

constexpr char gc_MachineListing[] = "/opt/lsvtc/bin/lsvtc -t0";
constexpr std::string::size_type gc_TM_PrefixLength = 4;
constexpr std::string::size_type gc_SE_PrefixLength = 6;

struct Expected_Machine {
    unsigned int objectType;
    std::string typeModel;
    std::string serial;
};

// An entry is object type ":" name; it counts only when something follows the
// first ":", and the name ends at the next ":".
bool u_expect_Machine(std::string const& entry, Expected_Machine& machine) {
    std::string::size_type const colon = entry.find(':');
    if (entry.empty() || colon == std::string::npos || colon + 1 == entry.size()) {
        return false;
    }
    bool overflow = false;
    bool hasDigits = false;
    unsigned long long const objectType =
        Fuzz_Utility::u_expected_Unsigned(entry.substr(0, colon), overflow, hasDigits);
    if (overflow || !hasDigits) {
        return false;
    }
    std::string const name = entry.substr(colon + 1, entry.find(':', colon + 1) - colon - 1);
    std::string typeModel;
    std::string serial;
    Fuzz_Utility::u_expected_TM_SE(name, typeModel, serial);
    machine.objectType = static_cast<std::uint32_t>(objectType);
    machine.typeModel = Fuzz_Utility::u_without_ConsolePrefix(typeModel, gc_TM_PrefixLength);
    machine.serial = Fuzz_Utility::u_without_ConsolePrefix(serial, gc_SE_PrefixLength);
    return true;
}

std::vector<Expected_Machine> u_expect_Machines(std::string const& output) {
    std::string const firstLine = Fuzz_Utility::u_expected_Lines(output).front();
    std::vector<Expected_Machine> machines;
    if (firstLine.empty()) {
        return machines;
    }
    for (std::string const& entry : Fuzz_Utility::u_expected_Pieces(firstLine, ";")) {
        Expected_Machine machine;
        if (u_expect_Machine(entry, machine)) {
            machines.push_back(machine);
        }
    }
    return machines;
}

void u_check_Order(Quorvex::PYLON::ListOf_Machines machines) {
    std::sort(machines.begin(), machines.end());
    for (std::size_t i = 0; i < machines.size(); ++i) {
        // cppcheck-suppress duplicateExpression ; nothing sorts before itself
        Fuzz_Utility::u_require(!(machines[i] < machines[i]),
                                "a machine does not sort before itself",
                                std::string(machines[i].get_MTMS()));
        if (i > 0) {
            Fuzz_Utility::u_require(!(machines[i] < machines[i - 1]),
                                    "sorted machines are in order",
                                    std::string(machines[i].get_MTMS()));
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    // The runner's trace goes nowhere but is still written.
    static Utility::Trace trace("/dev/null");
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    std::string const output(reinterpret_cast<char const*>(data), size);
    Fuzz_Console::u_set_Output(output);
    Fuzz_Console::u_clear_Commands();

    Quorvex::PYLON::ListOf_Machines const machines;

    Fuzz_Utility::u_require(Fuzz_Console::u_get_Commands() ==
                                std::vector<std::string>{gc_MachineListing},
                            "the listing tool runs once with its exact command line");
    std::vector<Expected_Machine> const expected = u_expect_Machines(output);
    Fuzz_Utility::u_require(machines.size() == expected.size(),
                            "one machine per well-formed entry of the first line", output);
    for (std::size_t i = 0; i < machines.size(); ++i) {
        Quorvex::System::MTMS const& mtms = machines[i].get_MTMS();
        Fuzz_Utility::u_require(machines[i].get_ObjectType() == expected[i].objectType,
                                "the object type is the entry's number, narrowed", output);
        Fuzz_Utility::u_require(mtms.get_MachineType_Model() == expected[i].typeModel,
                                "the type-model is the name before its last \"_\"", output);
        Fuzz_Utility::u_require(mtms.get_Serial() == expected[i].serial,
                                "the serial is the name after its last \"_\"", output);
    }
    u_check_Order(machines);
    return 0;
}
