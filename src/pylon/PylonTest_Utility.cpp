#include "pylon/PylonTest_Utility.h"

#include "utility/Trace.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <regex>
#include <sched.h>
#include <sstream>
#include <sys/mount.h>

namespace PylonTest_Utility {

namespace {

constexpr char gc_TraceFolder[] = "/var/adm/quorvex/Trace/";
constexpr char gc_CommandHeader[] = "****** ShellCommand::execute ******";
constexpr char gc_TemporaryFolder[] = "/tmp";
constexpr int gc_ExitCheckFailed = 1;
constexpr int gc_ExitNoReadOnlyTmp = 2;

std::string _u_normalised(std::string const& text) {
    static std::regex const generated("(/tmp/ShellCommand\\.)[A-Za-z0-9]{6}");
    return std::regex_replace(text, generated, "$1XXXXXX");
}

bool _u_makeTmpReadOnly() {
    return ::unshare(CLONE_NEWNS) == 0 &&
           ::mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           ::mount(gc_TemporaryFolder, gc_TemporaryFolder, nullptr, MS_BIND, nullptr) == 0 &&
           ::mount(nullptr, gc_TemporaryFolder, nullptr, MS_REMOUNT | MS_BIND | MS_RDONLY,
                   nullptr) == 0;
}

} // namespace

std::vector<std::string> u_describe(::Quorvex::PYLON::ListOf_Machines const& machines) {
    std::vector<std::string> described(machines.size());
    std::transform(machines.begin(), machines.end(), described.begin(),
                   [](::Quorvex::PYLON::Machine const& machine) {
                       return std::to_string(machine.get_ObjectType()) + "|" +
                              machine.get_MTMS().get_MachineType_Model() + "|" +
                              machine.get_MTMS().get_Serial();
                   });
    return described;
}

std::vector<std::string> u_describe(::Quorvex::PYLON::ListOf_Partitions const& partitions) {
    std::vector<std::string> described(partitions.size());
    std::transform(partitions.begin(), partitions.end(), described.begin(),
                   [](::Quorvex::System::Partition const& partition) {
                       return std::string(partition.get_MTMS()) + "|" +
                              partition.get_PartitionID() + "|" + partition.get_IP() + "|" +
                              partition.get_ActiveStatus() + "|" + partition.get_HostName() + "|" +
                              partition.get_OperatingSystem_Name() + "|" +
                              partition.get_OperatingSystem_Version();
                   });
    return described;
}

std::vector<std::string> u_tracedCommandLines(std::string const& traceName,
                                              std::function<void()> const& work) {
    std::string const path = gc_TraceFolder + traceName;
    // The child starts the test program afresh: a trace object that wrote
    // before any trace file was open (an earlier test of this process ran a
    // listing) stays failed, and a forked copy would inherit it.
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            {
                ::Utility::Trace trace(path);
                work();
            }
            std::exit(0);
        },
        ::testing::ExitedWithCode(0), "");
    std::istringstream lines(_u_normalised(QuorvexTest::readFile(path)));
    std::vector<std::string> commandLines;
    std::string line;
    while (std::getline(lines, line)) {
        if (line == gc_CommandHeader && std::getline(lines, line)) {
            commandLines.push_back(line);
        }
    }
    return commandLines;
}

void u_exitWithReadOnlyTmp(std::function<bool()> const& check) {
    if (!_u_makeTmpReadOnly()) {
        std::exit(gc_ExitNoReadOnlyTmp);
    }
    std::exit(check() ? 0 : gc_ExitCheckFailed);
}

} // namespace PylonTest_Utility
