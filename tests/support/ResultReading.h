#pragma once
// Reading a worker's whole result in a test, where waiting is what is wanted.

#include <poll.h>

#include <string>

namespace QuorvexTest {

// Reads what a forked worker writes until its result pipe is at its end and
// returns all of it. Worker is any type with readAvailable(),
// resultDescriptor() and result(), as quorvex-survey's ChildProcess has;
// a template, so that the test support library needs none of the program's.
template <typename Worker> std::string readResultToEnd(Worker& worker) {
    while (worker.readAvailable()) {
        pollfd descriptor{worker.resultDescriptor(), POLLIN, 0};
        poll(&descriptor, 1, 1000);
    }
    return worker.result();
}

} // namespace QuorvexTest
