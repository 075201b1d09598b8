#include "FaultTimings.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>
#include <stdexcept>

namespace FleetFaultTest {

namespace {

constexpr char gc_SeedVariable[] = "QUORVEX_FAULT_SEED";
constexpr char gc_RunsVariable[] = "QUORVEX_FAULT_RUNS";
constexpr int gc_DefaultRuns = 2;

std::string currentTestName() {
    ::testing::TestInfo const* test = ::testing::UnitTest::GetInstance()->current_test_info();
    return test == nullptr ? "" : std::string(test->test_suite_name()) + "." + test->name();
}

// A whole number from the environment; the fallback when the variable is
// unset; a malformed value stops the test rather than running another case.
std::uint64_t numberFromEnvironment(char const* name, std::uint64_t fallback) {
    char const* text = std::getenv(name);
    if (text == nullptr || *text == '\0') {
        return fallback;
    }
    char* end = nullptr;
    unsigned long long const value = std::strtoull(text, &end, 10);
    if (*end != '\0') {
        throw std::invalid_argument(std::string(name) + " must be a whole number, not '" + text +
                                    "'");
    }
    return value;
}

} // namespace

FaultTimings::FaultTimings()
    : _seed(numberFromEnvironment(gc_SeedVariable, std::random_device{}())),
      _generator(_seed ^ std::hash<std::string>{}(currentTestName())) {}

double FaultTimings::between(double low, double high) {
    return std::uniform_real_distribution<double>(low, high)(_generator);
}

int FaultTimings::wholeBetween(int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(_generator);
}

std::string FaultTimings::replayHint() const {
    return std::string(gc_SeedVariable) + "=" + std::to_string(_seed) + " " + gc_RunsVariable +
           "=" + std::to_string(runsPerCase()) + " --gtest_filter=" + currentTestName();
}

int FaultTimings::runsPerCase() {
    return static_cast<int>(numberFromEnvironment(gc_RunsVariable, gc_DefaultRuns));
}

} // namespace FleetFaultTest
