#pragma once
// The sandbox runner, tools/sandbox: a private mount namespace where the
// simulated console sits at the console's fixed tool paths, the result
// folders are fresh and /tmp is private.
//
// Tests registered with quorvex_add_gtest(... SANDBOX) run inside it:
// /var/adm/quorvex/VPD and /var/adm/quorvex/Trace are fresh empty folders.

#include "ChildProcess.h"

#include <functional>
#include <string>
#include <vector>

namespace QuorvexTest {

// Absolute path of tools/sandbox.
std::string sandboxPath();

// True inside the namespace made by tools/sandbox for the test main.
bool isInsideSandbox();

// The sandbox binds the folders a command needs that lie under /tmp (this
// checkout, the working folder) into its private /tmp. These are the names
// such folders have directly in /tmp, empty when the checkout is elsewhere.
std::vector<std::string> namesKeptInTmp();
// names without those kept in /tmp by the sandbox.
std::vector<std::string> withoutNamesKeptInTmp(std::vector<std::string> names);

// Runs a command in a sandbox of its own, with the simulator installed and
// extra sandbox options such as "--readonly-tmp" (see tools/sandbox --help).
// Works on the host and, nested, inside a sandboxed test; the folders of the
// current scenario and invocation log (see SimulatedConsole) are bound into
// the new sandbox at the same paths.
CommandResult runInSandbox(std::vector<std::string> const& sandboxOptions,
                           std::vector<std::string> const& command);

// Possible results of checkWithReadOnlyTmp.
inline constexpr int gc_CheckHeld = 0;
inline constexpr int gc_CheckFailed = 1;
inline constexpr int gc_NoReadOnlyTmp = 2;

// Runs check in a child process with a mount namespace of its own where /tmp
// is read-only (its files stay readable), so that no shell command can make
// its output files there; in a proot sandbox, where no namespace can be made,
// /tmp loses its write permission for the time of the check instead.
// Returns gc_CheckHeld or gc_CheckFailed, or gc_NoReadOnlyTmp when /tmp could
// not be made read-only.
int checkWithReadOnlyTmp(std::function<bool()> const& check);

} // namespace QuorvexTest
