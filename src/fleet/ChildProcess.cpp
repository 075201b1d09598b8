#include "fleet/ChildProcess.h"

#include "fleet/ProcessTree.h"
#include "fleet/WorkerLife.h"
#include "utility/FileText.h"
#include "utility/TemporaryFile.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <iostream>
#include <new>
#include <utility>

namespace fleet {

ChildProcess::Slot* ChildProcess::ms_ownSlot = nullptr;

namespace {

// The child starts with the signal dispositions a plain program has.
void restoreDefaultSignals() {
    std::signal(SIGINT, SIG_DFL);
    std::signal(SIGTERM, SIG_DFL);
    std::signal(SIGHUP, SIG_DFL);
    std::signal(SIGPIPE, SIG_DFL);
}

// What the worker does once its parent is gone: it is about to end.
[[noreturn]] void waitForTheEnd() {
    while (true) {
        pause();
    }
}

} // namespace

ChildProcess::ChildProcess(Body const& body) {
    // An anonymous mapping takes -1 as its descriptor.
    void* memory =
        // cppcheck-suppress invalidFunctionArg
        mmap(nullptr, sizeof(Slot), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED) {
        _fail("cannot map the stop note slot");
        return;
    }
    _slot = new (memory) Slot{};
    int ends[2];
    // Close-on-exec: the commands the child runs must not hold the pipe open.
    if (pipe2(ends, O_CLOEXEC) != 0) {
        _fail("cannot create the result pipe");
        return;
    }
    // Nothing buffered in the parent may be written twice by a child.
    std::cout.flush();
    std::cerr.flush();
    pid_t const parent = getpid();
    _pid = fork();
    if (_pid == 0) {
        close(ends[0]);
        _runChild(body, ends[1], parent);
    }
    if (_pid < 0) {
        _fail("cannot fork");
        close(ends[0]);
        close(ends[1]);
        return;
    }
    close(ends[1]);
    _readEnd = ends[0];
    fcntl(_readEnd, F_SETFL, fcntl(_readEnd, F_GETFL) | O_NONBLOCK);
}

// errno is read before anything else can change it.
void ChildProcess::_fail(char const* operation) {
    _startFailure = std::string(operation) + ": " + std::strerror(errno);
}

void ChildProcess::_runChild(Body const& body, int writeEnd, pid_t parent) {
    restoreDefaultSignals();
    setpgid(0, 0);
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    ms_ownSlot = _slot;
    Utility::TemporaryFile::ms_Observer = &ChildProcess::_recordTemporaryFile;
    bool delivered = false;
    try {
        tieToParent(parent);
        keepDescriptorsFromActions();
        std::string const text = body();
        keepBrokenPipeFromEndingWorker();
        delivered = util::writeAll(writeEnd, text);
    } catch (...) {
        delivered = false;
    }
    close(writeEnd);
    // The parent reads a result cut short as it is; the status says so.
    endWorker(delivered ? 0 : 1);
}

ChildProcess::~ChildProcess() {
    killAndReap();
    if (_readEnd >= 0) {
        close(_readEnd);
    }
    if (_slot != nullptr) {
        munmap(_slot, sizeof(Slot));
    }
}

bool ChildProcess::isStarted() const {
    return _pid > 0;
}

std::optional<std::string> ChildProcess::startFailure() const {
    return _startFailure;
}

pid_t ChildProcess::pid() const {
    return _pid;
}

int ChildProcess::resultDescriptor() const {
    return _readEnd;
}

bool ChildProcess::readAvailable() {
    if (_readEnd < 0) {
        return false;
    }
    char buffer[65536];
    while (true) {
        ssize_t const n = read(_readEnd, buffer, sizeof buffer);
        if (n > 0) {
            _result.append(buffer, static_cast<std::size_t>(n));
            continue;
        }
        if (n < 0 && errno == EINTR) {
            continue;
        }
        if (n < 0 && errno == EAGAIN) {
            return true;
        }
        close(_readEnd);
        _readEnd = -1;
        return false;
    }
}

std::string const& ChildProcess::result() const {
    return _result;
}

std::string ChildProcess::takeResult() {
    return std::exchange(_result, std::string());
}

bool ChildProcess::reap() {
    if (_reaped || _pid <= 0) {
        return true;
    }
    int status = 0;
    pid_t const ended = waitpid(_pid, &status, WNOHANG);
    if (ended == _pid) {
        _settleReaped(status);
    } else if (ended < 0 && errno == ECHILD) {
        _settleReaped(std::nullopt);
    }
    return _reaped;
}

bool ChildProcess::isReaped() const {
    return _reaped || _pid <= 0;
}

std::optional<int> ChildProcess::waitStatus() const {
    return _waitStatus;
}

void ChildProcess::_settleReaped(std::optional<int> status) {
    _reaped = true;
    _stopped = false;
    _waitStatus = status;
    _removeTemporaryFiles(_slot);
}

void ChildProcess::removeOwnTemporaryFiles() {
    _removeTemporaryFiles(ms_ownSlot);
}

// The child is gone, or ends: a file it recorded as made and not yet as
// removed is its own (made exclusively, under a name no other process can
// have made while it exists), and no process uses it any more.
void ChildProcess::_removeTemporaryFiles(Slot* slot) {
    if (slot == nullptr) {
        return;
    }
    for (FileEntry& entry : slot->files) {
        if (entry.inUse.load() != 0) {
            unlink(entry.name);
            entry.inUse.store(0);
        }
    }
}

// Child side. The entry is filled before it is marked in use, and marked
// free before the file is deleted, so the parent only ever removes a name
// that is still the child's file. A killed child leaves a file behind only
// when it dies between making the file and recording it, or between
// freeing the entry and deleting the file.
// A file made once the parent is gone is removed here, before any command
// can use it; one made before is recorded in time for the thread that ends
// the worker, which marks the parent gone before it removes what is recorded.
void ChildProcess::_recordTemporaryFile(std::string const& name, bool made) {
    _noteTemporaryFile(name, made);
    if (made && isParentGone()) {
        unlink(name.c_str());
        waitForTheEnd();
    }
}

void ChildProcess::_noteTemporaryFile(std::string const& name, bool made) {
    if (ms_ownSlot == nullptr || name.size() >= sizeof(FileEntry::name)) {
        return;
    }
    for (FileEntry& entry : ms_ownSlot->files) {
        if (made && entry.inUse.load() == 0) {
            std::memcpy(entry.name, name.c_str(), name.size() + 1);
            entry.inUse.store(1);
            return;
        }
        if (!made && entry.inUse.load() != 0 && name == entry.name) {
            entry.inUse.store(0);
            return;
        }
    }
}

bool ChildProcess::stop() {
    if (isReaped()) {
        return false;
    }
    if (_stopped) {
        return true;
    }
    ChildStop const outcome = stopChild(_pid);
    // Ended: reaped by the wait. Gone: no wait can find it any more.
    _stopped = outcome.state == ChildStop::State::Stopped;
    if (outcome.state == ChildStop::State::Ended) {
        _settleReaped(outcome.waitStatus);
    } else if (outcome.state == ChildStop::State::Gone) {
        _settleReaped(std::nullopt);
    }
    return _stopped;
}

void ChildProcess::resume() {
    if (_stopped && !isReaped()) {
        kill(_pid, SIGCONT);
        _stopped = false;
    }
}

bool ChildProcess::isStopped() const {
    return _stopped;
}

// Stopped first, so that it starts nothing while what it started is killed.
// SIGKILL ends a stopped child too, so the wait below never waits on one
// that stays stopped.
void ChildProcess::killAndReap() {
    if (!stop()) {
        return;
    }
    killDescendants(_pid);
    kill(_pid, SIGKILL);
    int status = 0;
    while (waitpid(_pid, &status, 0) < 0 && errno == EINTR) {
    }
    _settleReaped(status);
}

std::string ChildProcess::stopNote() {
    if (ms_ownSlot == nullptr || ms_ownSlot->hasNote.load() == 0) {
        return "";
    }
    return std::string(ms_ownSlot->note);
}

void ChildProcess::setStopNote(std::string const& note) {
    if (_slot == nullptr) {
        return;
    }
    std::size_t const length = std::min(note.size(), sizeof(_slot->note) - 1);
    std::memcpy(_slot->note, note.data(), length);
    _slot->note[length] = '\0';
    _slot->hasNote.store(1);
}

} // namespace fleet
