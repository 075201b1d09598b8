#include "fleet/SignalPipe.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstring>

namespace fleet {

namespace {

constexpr int gc_HandledSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGPIPE};

int gs_ReadEnd = -1;
int gs_WriteEnd = -1;
int gs_FirstSignal = 0;

void handleSignal(int signalNumber) {
    int const savedErrno = errno;
    auto const byte = static_cast<unsigned char>(signalNumber);
    // A full pipe already holds a signal for the loop; this one adds nothing.
    ssize_t const written = write(gs_WriteEnd, &byte, 1);
    static_cast<void>(written);
    errno = savedErrno;
}

sigset_t handledSignals() {
    sigset_t set;
    sigemptyset(&set);
    for (int const signalNumber : gc_HandledSignals) {
        sigaddset(&set, signalNumber);
    }
    return set;
}

std::string failure(char const* operation) {
    return std::string(operation) + ": " + std::strerror(errno);
}

} // namespace

std::optional<std::string> installSignalPipe() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0) {
        return failure("cannot create the signal pipe");
    }
    gs_ReadEnd = ends[0];
    gs_WriteEnd = ends[1];
    struct sigaction action {};
    action.sa_handler = &handleSignal;
    sigemptyset(&action.sa_mask);
    action.sa_flags = SA_RESTART;
    for (int const signalNumber : gc_HandledSignals) {
        if (sigaction(signalNumber, &action, nullptr) != 0) {
            return failure((std::string("cannot handle ") + signalName(signalNumber)).c_str());
        }
    }
    // A signal blocked by whoever started the run would never reach the pipe.
    sigset_t const handled = handledSignals();
    sigprocmask(SIG_UNBLOCK, &handled, nullptr);
    return std::nullopt;
}

void holdSignals() {
    sigset_t const handled = handledSignals();
    sigprocmask(SIG_BLOCK, &handled, nullptr);
}

int signalPipeDescriptor() {
    return gs_ReadEnd;
}

int takeSignal() {
    unsigned char byte = 0;
    while (gs_ReadEnd >= 0 && read(gs_ReadEnd, &byte, 1) == 1) {
        if (gs_FirstSignal == 0) {
            gs_FirstSignal = byte;
        }
    }
    return gs_FirstSignal;
}

char const* signalName(int signalNumber) {
    switch (signalNumber) {
    case SIGTERM:
        return "SIGTERM";
    case SIGHUP:
        return "SIGHUP";
    case SIGPIPE:
        return "SIGPIPE";
    default:
        return "SIGINT";
    }
}

} // namespace fleet
