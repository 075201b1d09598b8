#include "Console.h"

#include "InvocationLog.h"
#include "RemoteActionRequest.h"
#include "Scenario.h"

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>
#include <optional>
#include <set>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace PylonSim {

namespace {

constexpr char gc_ScenarioVariable[] = "PYLON_SIM_SCENARIO";
constexpr char gc_LogVariable[] = "PYLON_SIM_LOG";
// The console's get-file action places its file relative to this folder.
// The simulator plays the console, not the survey tool, so it names the
// folder itself rather than taking it from the tool's src/survey/Survey_Files.cpp.
constexpr char gc_QuorvexFolder[] = "/var/adm/quorvex/";
constexpr char gc_UnknownActionLine[] = "Rc::3::RcCmd::0::RetStr1::unknown action::RetStr2::\n";
constexpr char const* gc_Actions[] = {"runCmdOnPartition", "getFileFromPartition",
                                      "putFileToPartition"};

std::string _environment(char const* name) {
    char const* value = std::getenv(name);
    return value == nullptr ? "" : value;
}

bool _isAction(std::string const& action) {
    return std::any_of(std::begin(gc_Actions), std::end(gc_Actions),
                       [&action](char const* known) { return action == known; });
}

// Without PYLON_SIM_SCENARIO every tool answers nothing and exits 0.
Scenario _loadScenario() {
    std::string const fileName = _environment(gc_ScenarioVariable);
    return fileName.empty() ? Scenario() : Scenario::load(fileName);
}

void _wait(double seconds) {
    if (seconds > 0.0) {
        std::this_thread::sleep_for(std::chrono::duration<double>(seconds));
    }
}

// A process that the tool starts and does not wait for, as a console action
// may leave a helper running: it waits, prints nothing and ends.
void _leaveChild(std::optional<double> const& seconds) {
    if (!seconds) {
        return;
    }
    std::cout.flush();
    std::cerr.flush();
    if (::fork() == 0) {
        _wait(*seconds);
        ::_exit(0);
    }
}

// A helper that a console action starts as a daemon: a child that starts a
// session of its own and a grandchild in it, the child ending at once, so
// that the helper is nobody's child and in no process group of the tool's.
// It waits, prints nothing and ends.
void _leaveDaemon(std::optional<double> const& seconds) {
    if (!seconds) {
        return;
    }
    std::cout.flush();
    std::cerr.flush();
    pid_t const child = ::fork();
    if (child == 0) {
        ::setsid();
        if (::fork() == 0) {
            _wait(*seconds);
        }
        ::_exit(0);
    }
    if (child > 0) {
        ::waitpid(child, nullptr, 0);
    }
}

// A chain of processes that keeps forking: each one starts the next and
// ends, so that no single PID stays for a stopper to find. It ends by
// itself after half a minute, so that a chain nobody stops does not run on.
void _forkStorm() {
    constexpr int c_Generations = 1500;
    if (::fork() != 0) {
        return;
    }
    for (int generation = 0; generation < c_Generations; ++generation) {
        _wait(0.02);
        if (::fork() != 0) {
            ::_exit(0);
        }
    }
    ::_exit(0);
}

// What a hung console action may do to resist being stopped.
void _misbehave(std::set<std::string> const& misbehaviours) {
    std::cout.flush();
    std::cerr.flush();
    if (misbehaviours.count("ignore-signals") != 0) {
        std::signal(SIGINT, SIG_IGN);
        std::signal(SIGTERM, SIG_IGN);
        std::signal(SIGHUP, SIG_IGN);
    }
    if (misbehaviours.count("close-stdout") != 0) {
        ::close(STDOUT_FILENO);
    }
    if (misbehaviours.count("rename") != 0) {
        ::prctl(PR_SET_NAME, "renamed-action");
    }
    if (misbehaviours.count("fork-storm") != 0) {
        _forkStorm();
    }
    if (misbehaviours.count("stop-self") != 0) {
        ::raise(SIGSTOP);
    }
}

int _print(Response const& response, std::string const& diagnostic) {
    std::cout.write(response.stdoutText.data(),
                    static_cast<std::streamsize>(response.stdoutText.size()));
    std::cout.flush();
    std::cerr << diagnostic;
    std::cerr.write(response.stderrText.data(),
                    static_cast<std::streamsize>(response.stderrText.size()));
    std::cerr.flush();
    return response.exitCode;
}

// The identity after the first "-c"; "*" (the default section) without one.
std::string _identity(std::vector<std::string> const& arguments) {
    for (std::size_t i = 0; i + 1 < arguments.size(); ++i) {
        if (arguments[i] == "-c") {
            return arguments[i + 1];
        }
    }
    return "*";
}

} // namespace

bool Console::isTool(std::string const& name) {
    return name == "lsvtc" || name == "lspartition" || name == "runact-api";
}

int Console::answer(std::string const& tool, std::vector<std::string> const& arguments) {
    _log(tool, arguments);
    try {
        return tool == "runact-api" ? _answerRemoteAction(arguments)
                                    : _answerListing(tool, arguments);
    } catch (ScenarioError const& error) {
        _reportBadScenario(error.describe());
        return gc_ExitBadScenario;
    }
}

int Console::check(std::string const& fileName) {
    try {
        Scenario::load(fileName);
        return 0;
    } catch (ScenarioError const& error) {
        _reportBadScenario(error.describe());
        return gc_ExitBadScenario;
    }
}

void Console::_log(std::string const& tool, std::vector<std::string> const& arguments) {
    std::string const fileName = _environment(gc_LogVariable);
    if (!fileName.empty() &&
        !InvocationLog::append(fileName, InvocationLog::formatLine(tool, arguments))) {
        std::cerr << "pylon-sim: cannot append to the invocation log " << fileName << std::endl;
    }
}

void Console::_reportBadScenario(std::string const& description) {
    std::cerr << "pylon-sim: bad scenario: " << description << std::endl;
}

int Console::_answerListing(std::string const& tool, std::vector<std::string> const& arguments) {
    Scenario const scenario = _loadScenario();
    std::string const name = tool == "lsvtc" ? "" : _identity(arguments);
    Response const response = scenario.find(tool, name);
    _leaveChild(response.childDelay);
    _leaveDaemon(response.daemonDelay);
    _misbehave(response.misbehaviours);
    _wait(response.delay.value_or(scenario.get_DefaultDelay()));
    return _print(response, "");
}

int Console::_answerRemoteAction(std::vector<std::string> const& arguments) {
    Scenario const scenario = _loadScenario();
    RemoteActionRequest const request(arguments);
    if (!_isAction(request.get_Action())) {
        Response unknown;
        unknown.stdoutText = gc_UnknownActionLine;
        unknown.exitCode = gc_ExitUnknownAction;
        _wait(scenario.get_DefaultDelay());
        return _print(unknown, "runact-api: unknown action \"" + request.get_Action() + "\"\n");
    }
    Response const response = scenario.find(request.get_Action(), request.get_PartitionID());
    _leaveChild(response.childDelay);
    _leaveDaemon(response.daemonDelay);
    _misbehave(response.misbehaviours);
    _wait(response.delay.value_or(scenario.get_DefaultDelay()));
    std::string const diagnostic =
        response.document ? _placeDocument(request, *response.document) : std::string();
    return _print(response, diagnostic);
}

std::string Console::_placeDocument(RemoteActionRequest const& request,
                                    std::string const& document) {
    if (!request.has_LocalFN()) {
        return "runact-api: no LocalFN given, no document placed\n";
    }
    std::string const fileName = gc_QuorvexFolder + request.get_LocalFN();
    std::ofstream out(fileName, std::ios::binary | std::ios::trunc);
    out.write(document.data(), static_cast<std::streamsize>(document.size()));
    out.close();
    return out ? "" : "runact-api: cannot write " + fileName + "\n";
}

} // namespace PylonSim
