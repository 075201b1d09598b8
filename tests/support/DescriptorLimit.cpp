#include "DescriptorLimit.h"

#include <unistd.h>

#include <stdexcept>

namespace QuorvexTest {

NoFreeDescriptors::NoFreeDescriptors() {
    if (getrlimit(RLIMIT_NOFILE, &_saved) != 0) {
        throw std::runtime_error("cannot read the descriptor limit");
    }
    int const lowestFree = dup(STDIN_FILENO);
    if (lowestFree < 0) {
        throw std::runtime_error("no descriptor to begin with");
    }
    close(lowestFree);
    rlimit lowered = _saved;
    lowered.rlim_cur = static_cast<rlim_t>(lowestFree);
    if (setrlimit(RLIMIT_NOFILE, &lowered) != 0) {
        throw std::runtime_error("cannot lower the descriptor limit");
    }
}

NoFreeDescriptors::~NoFreeDescriptors() {
    setrlimit(RLIMIT_NOFILE, &_saved);
}

} // namespace QuorvexTest
