#include "relay/Base.h"

#include "relay/RELAY_Utility.h"
#include "utility/ShellCommand.h"
#include "utility/StringUtility.h"

#include <iterator>

namespace Quorvex::RELAY {

namespace {

constexpr char gc_RemoteActionTool[] = "/usr/bin/runact-api -c ";
constexpr char gc_ServiceEventClass[] = "ZOR.ServiceEvent::";
constexpr char gc_NoAction[] = "ERROR_NO_ACTION";

} // namespace

Base::Base() : _CallerID(0), _Action(gc_NoAction), _Target(), _Output(), _ReturnCodes() {}

Base::Base(TargetPartition const& target)
    : _CallerID(0), _Action(gc_NoAction), _Target(target), _Output(), _ReturnCodes() {}

void Base::set_Action(std::string const& action) {
    _Action = action;
}

TargetPartition& Base::get_TargetPartition() {
    return _Target;
}

std::string Base::createString_Command() const {
    return _createString_Command("");
}

std::string Base::_createString_Command(std::string const& parameters) const {
    // The tool expects an empty field between the class name and the action,
    // hence four colons in a row. The whole line is built with one allocation.
    // Kept for the remote action tool: see docs/compatibility.md#four-colons
    return StringUtility::concatenate({gc_RemoteActionTool, gc_ServiceEventClass, "::", _Action,
                                       "::", RELAY_Utility::create_Parameter("CallerID", _CallerID),
                                       "::", _Target._get_TargetText(),
                                       parameters.empty() ? "" : "::", parameters});
}

int Base::execute(std::string const& parameters) {
    // A fresh runner per call: a runner executes its command only once.
    Utility::ShellCommand command(_createString_Command(parameters));
    _Output.clear();
    _ReturnCodes.clear();
    int const exitCode = command.execute();
    if (exitCode == 0) {
        _Output.assign(command.stdout_begin(), command.stdout_end());
    }
    // A failing tool still says why in its output lines.
    _ReturnCodes.reserve(
        static_cast<std::size_t>(std::distance(command.stdout_begin(), command.stdout_end())));
    for (auto line = command.stdout_begin(); line != command.stdout_end(); ++line) {
        if (!line->empty()) {
            _ReturnCodes.emplace_back(*line);
        }
    }
    return exitCode;
}

ReturnCode const& Base::get_ReturnCode() const {
    return _ReturnCodes.empty() ? cBlankReturnCode : _ReturnCodes.front();
}

std::vector<ReturnCode> const& Base::get_ListOf_ReturnCodes() const {
    return _ReturnCodes;
}

std::vector<std::string> const& Base::get_Output() const {
    return _Output;
}

} // namespace Quorvex::RELAY
