#pragma once
// A process that can open no more descriptors, for the failures that follow.

#include <sys/resource.h>

namespace QuorvexTest {

// While it lives, no new descriptor can be opened in this process (pipe,
// open, dup fail with EMFILE): the soft limit is put at the lowest free
// descriptor, and put back when it goes.
class NoFreeDescriptors {
public:
    NoFreeDescriptors();
    ~NoFreeDescriptors();
    NoFreeDescriptors(NoFreeDescriptors const&) = delete;
    NoFreeDescriptors& operator=(NoFreeDescriptors const&) = delete;

private:
    rlimit _saved{};
};

} // namespace QuorvexTest
