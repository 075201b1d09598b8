#include "Sandbox.h"

#include "SimulatedConsole.h"
#include "TemporaryFiles.h"
#include "TestConstants.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <sched.h>
#include <sys/mount.h>

namespace QuorvexTest {

namespace {

constexpr char gc_TemporaryFolder[] = "/tmp";

// The folders of the current scenario and invocation log: a nested sandbox
// gets a /tmp of its own and would not see them otherwise.
std::vector<std::string> _simulatorFolders() {
    std::vector<std::string> folders;
    for (std::string const& path : activeSimulatorFiles()) {
        std::string const folder = std::filesystem::path(path).parent_path().string();
        if (!folder.empty() && fileExists(folder) &&
            std::find(folders.begin(), folders.end(), folder) == folders.end()) {
            folders.push_back(folder);
        }
    }
    std::sort(folders.begin(), folders.end());
    return folders;
}

// The sandbox option value that shows a host folder at the same path.
std::string _sameBinding(std::string const& folder) {
    return folder + ":" + folder;
}

bool _makeTmpReadOnly() {
    return ::unshare(CLONE_NEWNS) == 0 &&
           ::mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           ::mount(gc_TemporaryFolder, gc_TemporaryFolder, nullptr, MS_BIND, nullptr) == 0 &&
           ::mount(nullptr, gc_TemporaryFolder, nullptr, MS_REMOUNT | MS_BIND | MS_RDONLY,
                   nullptr) == 0;
}

bool _isProotSandbox() {
    char const* kind = std::getenv("QUORVEX_SANDBOX_KIND");
    return kind != nullptr && std::string(kind) == "proot";
}

// Under proot no mount namespace can be made, but the command runs without
// capabilities, so file modes hold: a /tmp without write permission refuses
// new files as a read-only mount does. Run in the child, which puts the mode
// back after the check, so the parent can still clear up in /tmp.
int _checkWithTmpWithoutWritePermission(std::function<bool()> const& check) {
    namespace fs = std::filesystem;
    constexpr fs::perms readAndSearchOnly = fs::perms::owner_read | fs::perms::owner_exec |
                                            fs::perms::group_read | fs::perms::group_exec |
                                            fs::perms::others_read | fs::perms::others_exec;
    std::error_code error;
    fs::perms const mode = fs::status(gc_TemporaryFolder, error).permissions();
    if (!error) {
        fs::permissions(gc_TemporaryFolder, readAndSearchOnly, error);
    }
    if (error) {
        return gc_NoReadOnlyTmp;
    }
    int const result = check() ? gc_CheckHeld : gc_CheckFailed;
    fs::permissions(gc_TemporaryFolder, mode, error);
    return result;
}

} // namespace

std::string sandboxPath() {
    return sourceRoot() + "/tools/sandbox";
}

bool isInsideSandbox() {
    char const* flag = std::getenv("QUORVEX_IN_SANDBOX");
    return flag != nullptr && std::string(flag) == "1";
}

std::vector<std::string> namesKeptInTmp() {
    std::vector<std::string> names;
    for (std::string const& folder : {sourceRoot(), std::filesystem::current_path().string()}) {
        std::filesystem::path const inTmp =
            std::filesystem::weakly_canonical(folder).lexically_relative(gc_TemporaryFolder);
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

int checkWithReadOnlyTmp(std::function<bool()> const& check) {
    if (_isProotSandbox()) {
        return runInChild([&check]() { return _checkWithTmpWithoutWritePermission(check); })
            .exitStatus;
    }
    return runInChild([&check]() {
               if (!_makeTmpReadOnly()) {
                   return gc_NoReadOnlyTmp;
               }
               return check() ? gc_CheckHeld : gc_CheckFailed;
           })
        .exitStatus;
}

} // namespace QuorvexTest
