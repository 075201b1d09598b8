#pragma once
// Random moments and lengths for the fault runs, from one seeded generator
// per test so that a failing run can be replayed: the seed comes from
// QUORVEX_FAULT_SEED when it is set, else from the system's entropy, and is
// mixed with the test's name, so one seed replays any single test alone.
// How often each case runs comes from QUORVEX_FAULT_RUNS (default 2; the
// slow label sets 20).

#include <cstdint>
#include <random>
#include <string>

namespace FleetFaultTest {

class FaultTimings {
public:
    // Seeded for the GoogleTest test that is running.
    FaultTimings();

    // A number drawn evenly from [low, high].
    double between(double low, double high);
    // A whole number drawn evenly from [low, high].
    int wholeBetween(int low, int high);
    // "QUORVEX_FAULT_SEED=<seed> ... --gtest_filter=<test>", for failure messages.
    std::string replayHint() const;

    // Runs per case.
    static int runsPerCase();

private:
    std::uint64_t _seed;
    std::mt19937_64 _generator;
};

} // namespace FleetFaultTest
