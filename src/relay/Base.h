#pragma once

#include "relay/ReturnCode.h"
#include "relay/TargetPartition.h"

#include <cstdint>
#include <string>
#include <vector>

namespace Quorvex::RELAY {

// One run of the console's remote action tool against a target partition:
// builds the command line, runs it and keeps its output and return codes.
// The remote operations share one Base through virtual inheritance; there
// are no virtual functions.
class Base {
public:
    Base();
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a target stands wherever a
    // remote action is expected
    Base(TargetPartition const& target);

    void set_Action(std::string const& action);
    TargetPartition& get_TargetPartition();

    // The command line up to and including the target, without parameters.
    std::string createString_Command() const;
    // Runs the command with "::" + parameters appended (nothing appended when
    // parameters is empty); returns the tool's exit code.
    int execute(std::string const& parameters);

    // The first return code of the last run, or cBlankReturnCode. The next
    // run replaces the codes: copy it before running again.
    ReturnCode const& get_ReturnCode() const;
    std::vector<ReturnCode> const& get_ListOf_ReturnCodes() const;
    // The output lines of the last run; empty when it exited non-zero.
    std::vector<std::string> const& get_Output() const;

private:
    // The command line, followed by "::" and the parameters when there are any.
    std::string _createString_Command(std::string const& parameters) const;

    std::int64_t _CallerID;
    std::string _Action;
    TargetPartition _Target;
    std::vector<std::string> _Output;
    std::vector<ReturnCode> _ReturnCodes;
};

} // namespace Quorvex::RELAY
