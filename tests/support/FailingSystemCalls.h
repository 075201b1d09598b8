#pragma once
// A process where some system calls fail as a failing disk makes them fail,
// for root too: a seccomp filter, inherited by every process it starts.

#include <string>
#include <vector>

namespace QuorvexTest {

// Makes each of calls (system call numbers, SYS_fsync say) fail with
// errorNumber in the calling thread and every process it starts from then
// on, without running them. Sets no_new_privs first, so it needs no
// privilege. "" once in place, else why not; meant for a child process.
std::string failSystemCalls(std::vector<long> const& calls, int errorNumber);

} // namespace QuorvexTest
