#pragma once
// Helpers of the survey driver's tests: work run in a child process with its
// standard output and standard error captured, the shared trace opened there,
// and the normalisation of the parts of a run's text that vary.

#include <functional>
#include <string>
#include <vector>

namespace SurveyTest_Utility {

struct ChildOutput {
    int exitStatus = -1;    // work's result, or 128 + the signal that ended the child
    std::string stdoutText; // exact bytes
    std::string stderrText; // exact bytes
};

// Runs work in a forked child, whose process-wide state (the shared trace,
// the standard streams) therefore leaves this process untouched. The child
// ends with work's result once its standard streams are flushed.
ChildOutput u_run_InChild(std::function<int()> const& work);

// The same, with the child's shared trace file opened on tracePath first and
// flushed after work.
ChildOutput u_run_InChild_Traced(std::string const& tracePath, std::function<int()> const& work);

// Replaces the generated part of every temporary file name "/tmp/ShellCommand."
// by "aaaaaa" for the first name met, "bbbbbb" for the second and so on.
std::string u_normalise_TemporaryNames(std::string const& text);

// Replaces the value of every timestamp="..." attribute that holds whole
// seconds from first to last (as 13 digits ending in "000") by
// "1700000000000"; other values stay as they are.
std::string u_normalise_TimeStamps(std::string const& text, long first, long last);

// The names of the entries of a folder, sorted; empty when it cannot be read.
std::vector<std::string> u_list_Folder(std::string const& folder);

// Removes every entry of a folder, the folder itself staying.
void u_clear_Folder(std::string const& folder);

} // namespace SurveyTest_Utility
