#include "DifferentialBatch.h"

#include "FleetTools.h"
#include "Lines.h"

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <iterator>
#include <stdexcept>

namespace FleetTest {

namespace {

constexpr char gc_Python[] = QUORVEX_PYTHON;
constexpr char gc_CaseGenerator[] = QUORVEX_FLEET_CASE_GENERATOR;
constexpr char gc_CaseRunner[] = QUORVEX_FLEET_CASE_RUNNER;

std::string caseName(int seed) {
    std::string digits = std::to_string(seed);
    return "gen-" + std::string(digits.size() < 3 ? 3 - digits.size() : 0, '0') + digits;
}

std::string joined(std::vector<int> const& numbers) {
    std::string text;
    for (int const number : numbers) {
        text += (text.empty() ? "" : ",") + std::to_string(number);
    }
    return text;
}

} // namespace

void DifferentialBatch::addGenerated(int firstSeed, int count) {
    QuorvexTest::CommandResult const made = QuorvexTest::runCommand(
        {gc_Python, gc_CaseGenerator, "--first-seed", std::to_string(firstSeed), "--count",
         std::to_string(count), _folder.path()});
    if (made.exitStatus != 0) {
        throw std::runtime_error("cannot generate the cases: " + made.stderrText);
    }
    for (int seed = firstSeed; seed < firstSeed + count; ++seed) {
        _caseFolders.push_back(_folder.file(caseName(seed)));
    }
}

void DifferentialBatch::addShipped(std::string const& caseName, std::string const& scenario,
                                   std::vector<std::string> const& identities, bool all) {
    std::string const folder = _folder.file(caseName);
    std::filesystem::create_directory(folder);
    QuorvexTest::writeFile(folder + "/shipped-console",
                           QuorvexTest::shippedScenario(scenario) + "\n");
    QuorvexTest::writeFile(folder + "/mode", all ? "all\n" : "identities\n");
    std::string lines;
    for (std::string const& identity : identities) {
        lines += identity + "\n";
    }
    QuorvexTest::writeFile(folder + "/identities", lines);
    _caseFolders.push_back(folder);
}

QuorvexTest::CommandResult DifferentialBatch::run(std::vector<int> const& jobCounts,
                                                  std::vector<std::string> const& sandboxOptions) {
    std::vector<std::string> command{"/bin/bash", gc_CaseRunner, oneMachineTool(),
                                     consoleWideTool(), joined(jobCounts)};
    command.insert(command.end(), _caseFolders.begin(), _caseFolders.end());
    _first = static_cast<long>(std::time(nullptr));
    std::vector<std::string> options{"--bind", _folder.path() + ":" + _folder.path()};
    if (!QuorvexTest::contains(sandboxOptions, "--no-vpd-dir")) {
        options.insert(options.end(), {"--vpd", _vpd.path()});
    }
    if (!QuorvexTest::contains(sandboxOptions, "--no-trace-dir")) {
        options.insert(options.end(), {"--trace", _trace.path()});
    }
    options.insert(options.end(), sandboxOptions.begin(), sandboxOptions.end());
    QuorvexTest::CommandResult result = QuorvexTest::runInSandbox(options, command);
    _last = static_cast<long>(std::time(nullptr));
    return result;
}

std::vector<DifferentialCase> DifferentialBatch::cases() const {
    std::vector<DifferentialCase> cases;
    cases.reserve(_caseFolders.size());
    std::transform(
        _caseFolders.begin(), _caseFolders.end(), std::back_inserter(cases),
        [this](std::string const& folder) { return DifferentialCase(folder, _first, _last); });
    return cases;
}

} // namespace FleetTest
