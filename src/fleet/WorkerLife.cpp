#include "fleet/WorkerLife.h"

#include "fleet/ChildProcess.h"
#include "fleet/ProcessTree.h"
#include "utility/SystemError.h"

#include <fcntl.h>
#include <linux/close_range.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <csignal>
#include <thread>

namespace fleet {

namespace {

// Sent by the kernel when the parent ends.
constexpr int gc_ParentGoneSignal = SIGUSR1;
// Also tells of the parent's end: when the parent dies while a process of
// the worker's group is stopped (an action that stopped itself, or one the
// run holds stopped), the kernel hangs the orphaned group up, and the worker
// must clean up rather than die of it.
constexpr int gc_HangUpSignal = SIGHUP;

// The pipe the signal handler writes to, read by the watching thread.
int gs_ParentGoneWriteEnd = -1;
pid_t gs_Parent = 0;
std::atomic<bool> gs_ParentGone{false};
// The worker's trace file, which only the parent would have taken.
std::string gs_TraceToRemove;

// Either signal counts only when the parent is really gone: one sent by an
// action to its group leaves a worker whose parent lives alone.
void onParentGone(int) {
    if (getppid() == gs_Parent) {
        return;
    }
    int const savedErrno = errno;
    char const byte = 1;
    // A full pipe already holds the news.
    [[maybe_unused]] ssize_t const written = write(gs_ParentGoneWriteEnd, &byte, 1);
    errno = savedErrno;
}

// The worker's other thread may run on meanwhile: it starts no new command
// once the parent is marked gone, and it too ends the worker only after it
// has killed everything below it.
[[noreturn]] void endWithActions() {
    gs_ParentGone.store(true);
    killDescendants(getpid());
    ChildProcess::removeOwnTemporaryFiles();
    endWorker(ChildProcess::ms_ParentGoneStatus);
}

void watchParentGone(int readEnd) {
    char byte = 0;
    while (read(readEnd, &byte, 1) < 0 && errno == EINTR) {
    }
    endWithActions();
}

} // namespace

// The handler and the thread are in place before the tie is made, and the
// parent is checked after it: a parent that ended before the tie sends no
// signal, but has left the worker to another parent.
void tieToParent(pid_t parent) {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0) {
        throw util::SystemError("cannot create", "the parent watch pipe", errno);
    }
    gs_ParentGoneWriteEnd = ends[1];
    gs_Parent = parent;
    struct sigaction action {};
    action.sa_handler = &onParentGone;
    action.sa_flags = SA_RESTART;
    sigemptyset(&action.sa_mask);
    sigaction(gc_ParentGoneSignal, &action, nullptr);
    sigaction(gc_HangUpSignal, &action, nullptr);
    std::thread(&watchParentGone, ends[0]).detach();
    if (prctl(PR_SET_PDEATHSIG, gc_ParentGoneSignal) != 0) {
        throw util::SystemError("cannot tie the worker to", "its parent", errno);
    }
    if (getppid() != parent) {
        endWithActions();
    }
}

bool isParentGone() {
    return gs_ParentGone.load();
}

void removeWhenParentGone(std::string const& path) {
    gs_TraceToRemove = path;
}

void keepBrokenPipeFromEndingWorker() {
    sigset_t brokenPipe;
    sigemptyset(&brokenPipe);
    sigaddset(&brokenPipe, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &brokenPipe, nullptr);
}

void endWorker(int status) {
    killDescendants(getpid());
    while (waitpid(-1, nullptr, WNOHANG) > 0) {
    }
    // Whichever thread ends the worker: with the parent gone nobody takes
    // the trace any more.
    if (gs_Parent != 0 && getppid() != gs_Parent && !gs_TraceToRemove.empty()) {
        unlink(gs_TraceToRemove.c_str());
    }
    _exit(status);
}

void keepDescriptorsFromActions() {
    close_range(STDERR_FILENO + 1, ~0U, CLOSE_RANGE_CLOEXEC);
}

} // namespace fleet
