// The partition list of one machine, fed with arbitrary output of the
// console's partition listing tool through the real public path.
// Input: the machine identity text as a FuzzedDataProvider string (up to its
// first NUL byte), then the tool's standard output.

#include "Fuzz_Console.h"
#include "Fuzz_Utility.h"

#include "pylon/ListOf_Partitions.h"
#include "pylon/Machine.h"
#include "system/MTMS.h"
#include "system/Partition.h"
#include "utility/Trace.h"

#include <fuzzer/FuzzedDataProvider.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace {

constexpr char gc_PartitionListing[] = "/opt/vtc/bin/lspartition -ix -c ";
// Any object type but 0 has no partitions listed.
constexpr unsigned int gc_UnlistedObjectType = 2;
constexpr std::size_t gc_NumberOf_Fields = 6;

// The six fields of each non-empty record of the first line; a missing field is "".
std::vector<std::vector<std::string>> u_expect_Records(std::string const& output) {
    std::string const firstLine = Fuzz_Utility::u_expected_Lines(output).front();
    std::vector<std::vector<std::string>> records;
    if (firstLine.empty()) {
        return records;
    }
    for (std::string const& record : Fuzz_Utility::u_expected_Pieces(firstLine, ";")) {
        if (record.empty()) {
            continue;
        }
        std::vector<std::string> fields = Fuzz_Utility::u_expected_Pieces(record, ",");
        fields.resize(gc_NumberOf_Fields);
        records.push_back(fields);
    }
    return records;
}

std::vector<std::string> u_get_Fields(Quorvex::System::Partition const& partition) {
    return {partition.get_PartitionID(),          partition.get_IP(),
            partition.get_ActiveStatus(),         partition.get_HostName(),
            partition.get_OperatingSystem_Name(), partition.get_OperatingSystem_Version()};
}

void u_check_Order(Quorvex::PYLON::ListOf_Partitions partitions) {
    std::sort(partitions.begin(), partitions.end());
    for (std::size_t i = 0; i < partitions.size(); ++i) {
        // cppcheck-suppress duplicateExpression ; nothing sorts before itself
        Fuzz_Utility::u_require(!(partitions[i] < partitions[i]),
                                "a partition does not sort before itself", partitions[i]);
        if (i > 0) {
            Fuzz_Utility::u_require(!(partitions[i] < partitions[i - 1]),
                                    "sorted partitions are in order", partitions[i]);
        }
    }
}

void u_check_UnlistedMachine(Quorvex::System::MTMS const& mtms) {
    Fuzz_Console::u_clear_Commands();
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(Quorvex::PYLON::Machine(gc_UnlistedObjectType, mtms));
    Fuzz_Utility::u_require(Fuzz_Console::u_get_Commands().empty() && partitions.empty(),
                            "a machine of another object type runs nothing and adds nothing");
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    // The runner's trace goes nowhere but is still written.
    static Utility::Trace trace("/dev/null");
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    FuzzedDataProvider provider(data, size);
    // An identity comes from the command line, which cannot carry a NUL byte.
    std::string const identity = provider.ConsumeRandomLengthString();
    Quorvex::System::MTMS const mtms(identity.substr(0, identity.find('\0')));
    std::string const output = provider.ConsumeRemainingBytesAsString();
    Fuzz_Console::u_set_Output(output);
    Fuzz_Console::u_clear_Commands();

    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(Quorvex::PYLON::Machine(0, mtms));

    Fuzz_Utility::u_require(Fuzz_Console::u_get_Commands() ==
                                std::vector<std::string>{gc_PartitionListing + std::string(mtms)},
                            "the listing tool runs once with the machine's identity");
    std::vector<std::vector<std::string>> const expected = u_expect_Records(output);
    Fuzz_Utility::u_require(partitions.size() == expected.size(),
                            "one partition per non-empty record of the first line", output);
    for (std::size_t i = 0; i < partitions.size(); ++i) {
        Fuzz_Utility::u_require(partitions[i].get_MTMS() == mtms,
                                "a partition carries the listed machine's identity", output);
        Fuzz_Utility::u_require(u_get_Fields(partitions[i]) == expected[i],
                                "the fields are the record's first six, unchanged", output);
    }
    u_check_Order(partitions);
    u_check_UnlistedMachine(mtms);
    return 0;
}
