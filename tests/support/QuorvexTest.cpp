#include "QuorvexTest.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <sstream>
#include <stdexcept>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace QuorvexTest {

namespace {

constexpr char gc_ScenarioVariable[] = "PYLON_SIM_SCENARIO";
constexpr char gc_LogVariable[] = "PYLON_SIM_LOG";

std::string _temporaryBase() {
    char const* base = std::getenv("TMPDIR");
    return (base != nullptr && *base != '\0') ? base : "/tmp";
}

// Replaces the child's descriptor fd by the file at path.
void _redirect(int fd, char const* path, int flags) {
    int const opened = ::open(path, flags, 0600);
    if (opened < 0 || ::dup2(opened, fd) < 0) {
        ::_exit(127);
    }
    ::close(opened);
}

[[noreturn]] void _execChild(std::vector<std::string> const& argv, std::string const& outPath,
                             std::string const& errPath) {
    _redirect(STDIN_FILENO, "/dev/null", O_RDONLY);
    _redirect(STDOUT_FILENO, outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC);
    _redirect(STDERR_FILENO, errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC);
    std::vector<char*> args;
    args.reserve(argv.size() + 1);
    std::transform(argv.begin(), argv.end(), std::back_inserter(args),
                   [](std::string const& arg) { return const_cast<char*>(arg.c_str()); });
    args.push_back(nullptr);
    ::execvp(args[0], args.data());
    std::string const message = "cannot run " + argv[0] + ": " + std::strerror(errno) + "\n";
    ssize_t const ignored = ::write(STDERR_FILENO, message.data(), message.size());
    static_cast<void>(ignored);
    ::_exit(127);
}

int _waitFor(pid_t child) {
    int status = 0;
    while (::waitpid(child, &status, 0) < 0) {
        if (errno != EINTR) {
            return -1;
        }
    }
    if (WIFEXITED(status)) {
        return WEXITSTATUS(status);
    }
    return WIFSIGNALED(status) ? 128 + WTERMSIG(status) : -1;
}

// Undoes the log's escapes: "\\" -> "\", "\t" -> TAB, "\n" -> line feed.
std::string _unescape(std::string const& field) {
    std::string text;
    for (std::size_t i = 0; i < field.size(); ++i) {
        if (field[i] != '\\' || i + 1 == field.size()) {
            text += field[i];
            continue;
        }
        char const next = field[++i];
        text += next == 't' ? '\t' : next == 'n' ? '\n' : next;
    }
    return text;
}

// The folders of the current scenario and invocation log: a nested sandbox
// gets a /tmp of its own and would not see them otherwise.
std::set<std::string> _simulatorFolders() {
    std::set<std::string> folders;
    for (char const* variable : {gc_ScenarioVariable, gc_LogVariable}) {
        char const* path = std::getenv(variable);
        if (path != nullptr && *path != '\0') {
            std::string const folder = std::filesystem::path(path).parent_path().string();
            if (!folder.empty() && fileExists(folder)) {
                folders.insert(folder);
            }
        }
    }
    return folders;
}

// The sandbox option value that shows a host folder at the same path.
std::string _sameBinding(std::string const& folder) {
    return folder + ":" + folder;
}

Invocation _parseLogLine(std::string const& line) {
    Invocation invocation;
    std::size_t start = 0;
    while (true) {
        std::size_t const tab = line.find('\t', start);
        invocation.push_back(_unescape(line.substr(start, tab - start)));
        if (tab == std::string::npos) {
            return invocation;
        }
        start = tab + 1;
    }
}

} // namespace

std::string sourceRoot() {
    return QUORVEX_SOURCE_ROOT;
}

std::vector<std::string> namesKeptInTmp() {
    std::vector<std::string> names;
    for (std::string const& folder : {sourceRoot(), std::filesystem::current_path().string()}) {
        std::filesystem::path const inTmp =
            std::filesystem::weakly_canonical(folder).lexically_relative("/tmp");
        std::string const first = inTmp.empty() ? "" : inTmp.begin()->string();
        if (!first.empty() && first != "." && first != ".." &&
            std::find(names.begin(), names.end(), first) == names.end()) {
            names.push_back(first);
        }
    }
    return names;
}

std::vector<std::string> withoutNamesKeptInTmp(std::vector<std::string> names) {
    for (std::string const& kept : namesKeptInTmp()) {
        names.erase(std::remove(names.begin(), names.end(), kept), names.end());
    }
    return names;
}

std::string sandboxPath() {
    return sourceRoot() + "/tools/sandbox";
}

std::string simulatorPath() {
    return QUORVEX_SIMULATOR;
}

std::string shippedScenario(std::string const& fileName) {
    return sourceRoot() + "/sim/scenarios/" + fileName;
}

bool isInsideSandbox() {
    char const* flag = std::getenv("QUORVEX_IN_SANDBOX");
    return flag != nullptr && std::string(flag) == "1";
}

TemporaryDirectory::TemporaryDirectory() {
    std::string pattern = _temporaryBase() + "/quorvex-test.XXXXXX";
    if (::mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary folder from " + pattern + ": " +
                                 std::strerror(errno));
    }
    _path = pattern;
}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
}

std::string const& TemporaryDirectory::path() const {
    return _path;
}

std::string TemporaryDirectory::file(std::string const& name) const {
    return _path + "/" + name;
}

std::string readFile(std::string const& path) {
    std::ifstream in(path, std::ios::binary);
    if (!in) {
        throw std::runtime_error("cannot read " + path);
    }
    std::ostringstream content;
    content << in.rdbuf();
    return content.str();
}

void writeFile(std::string const& path, std::string const& text) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << text;
    out.close();
    if (!out) {
        throw std::runtime_error("cannot write " + path);
    }
}

bool fileExists(std::string const& path) {
    struct stat info;
    return ::lstat(path.c_str(), &info) == 0;
}

CommandResult runCommand(std::vector<std::string> const& argv) {
    if (argv.empty()) {
        throw std::invalid_argument("runCommand needs a program");
    }
    TemporaryDirectory captured;
    std::string const outPath = captured.file("stdout");
    std::string const errPath = captured.file("stderr");
    pid_t const child = ::fork();
    if (child < 0) {
        throw std::runtime_error(std::string("fork failed: ") + std::strerror(errno));
    }
    if (child == 0) {
        _execChild(argv, outPath, errPath);
    }
    CommandResult result;
    result.exitStatus = _waitFor(child);
    result.stdoutText = readFile(outPath);
    result.stderrText = readFile(errPath);
    return result;
}

CommandResult runShell(std::string const& commandLine) {
    return runCommand({"/bin/sh", "-c", commandLine});
}

CommandResult runInSandbox(std::vector<std::string> const& sandboxOptions,
                           std::vector<std::string> const& command) {
    std::vector<std::string> argv{sandboxPath(), "--sim", simulatorPath()};
    for (std::string const& folder : _simulatorFolders()) {
        argv.emplace_back("--bind");
        argv.push_back(_sameBinding(folder));
    }
    argv.insert(argv.end(), sandboxOptions.begin(), sandboxOptions.end());
    argv.emplace_back("--");
    argv.insert(argv.end(), command.begin(), command.end());
    return runCommand(argv);
}

SimulatedConsole::SimulatedConsole(std::string const& scenarioText)
    : _scenarioPath(_directory.file("scenario.scn")), _logPath(_directory.file("invocations.log")) {
    writeFile(_scenarioPath, scenarioText);
    _activate();
}

SimulatedConsole::SimulatedConsole(ScenarioFile const& scenario)
    : _scenarioPath(scenario.path), _logPath(_directory.file("invocations.log")) {
    _activate();
}

void SimulatedConsole::_activate() const {
    ::setenv(gc_ScenarioVariable, _scenarioPath.c_str(), 1);
    ::setenv(gc_LogVariable, _logPath.c_str(), 1);
}

SimulatedConsole::~SimulatedConsole() {
    ::unsetenv(gc_ScenarioVariable);
    ::unsetenv(gc_LogVariable);
}

std::string const& SimulatedConsole::directory() const {
    return _directory.path();
}

std::string const& SimulatedConsole::scenarioPath() const {
    return _scenarioPath;
}

std::string const& SimulatedConsole::logPath() const {
    return _logPath;
}

std::string SimulatedConsole::logText() const {
    return fileExists(_logPath) ? readFile(_logPath) : std::string();
}

std::vector<Invocation> SimulatedConsole::invocations() const {
    return parseInvocationLog(logText());
}

std::vector<Invocation> parseInvocationLog(std::string const& text) {
    std::vector<Invocation> invocations;
    std::istringstream lines(text);
    std::string line;
    while (std::getline(lines, line)) {
        invocations.push_back(_parseLogLine(line));
    }
    return invocations;
}

} // namespace QuorvexTest
