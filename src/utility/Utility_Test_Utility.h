#pragma once

#include <functional>
#include <sstream>
#include <string>

namespace Utility::Utility_Test_Utility {

// A string buffer that counts the flushes reaching it.
class FlushCountingBuffer : public std::stringbuf {
public:
    int get_NumberOf_Flushes() const { return _flushes; }

protected:
    int sync() override {
        ++_flushes;
        return std::stringbuf::sync();
    }

private:
    int _flushes = 0;
};

// A scratch folder for one test. Child processes started by the test reuse
// the folder of the process that started them (its name travels in the
// environment), so both sides see the same files.
std::string u_get_ScratchDirectory();
void u_remove_ScratchDirectory();

// Runs body in a freshly started copy of the test program, so process-wide
// state (the shared trace file, the time zone, signal settings) starts clean
// and does not leak into other tests. body returns the child's exit status:
// 0 for success; on failure it should say why on standard error.
void u_run_InFreshProcess(std::function<int()> const& body);

// Replaces every temporary file name "/tmp/ShellCommand." + six characters
// with "/tmp/ShellCommand.XXXXXX".
std::string u_normalise_TemporaryNames(std::string const& text);

} // namespace Utility::Utility_Test_Utility
