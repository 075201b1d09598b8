#include "fleet/SignalPipe.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

namespace Fleet {

void SignalPipe::install() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0) {
        return;
    }
    ms_readEnd = ends[0];
    ms_writeEnd = ends[1];
    struct sigaction action {};
    action.sa_handler = &SignalPipe::_handle;
    sigemptyset(&action.sa_mask);
    action.sa_flags = SA_RESTART;
    sigaction(SIGINT, &action, nullptr);
    sigaction(SIGTERM, &action, nullptr);
}

int SignalPipe::readDescriptor() {
    return ms_readEnd;
}

void SignalPipe::_handle(int signalNumber) {
    int const savedErrno = errno;
    auto const byte = static_cast<unsigned char>(signalNumber);
    // A full pipe already holds a signal for the loop; this one adds nothing.
    ssize_t const written = write(ms_writeEnd, &byte, 1);
    static_cast<void>(written);
    errno = savedErrno;
}

int SignalPipe::takeSignal() {
    unsigned char byte = 0;
    while (ms_readEnd >= 0 && read(ms_readEnd, &byte, 1) == 1) {
        if (ms_firstSignal == 0) {
            ms_firstSignal = byte;
        }
    }
    return ms_firstSignal;
}

} // namespace Fleet
