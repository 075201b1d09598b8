// Test main of every sandboxed test executable: outside the sandbox it runs
// the same executable again, with the same arguments, through tools/sandbox
// with the simulated console installed; inside it runs the tests.
// Listing the tests needs no sandbox, so test discovery works anywhere.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <iterator>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

bool _asksOnlyForTestList(int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        if (std::string(argv[i]).rfind("--gtest_list_tests", 0) == 0) {
            return true;
        }
    }
    return false;
}

std::string _ownExecutable(char const* argv0) {
    std::vector<char> buffer(4096);
    ssize_t const length = ::readlink("/proc/self/exe", buffer.data(), buffer.size() - 1);
    return length > 0 ? std::string(buffer.data(), static_cast<std::size_t>(length)) : argv0;
}

// Replaces this process by tools/sandbox running this executable; the
// sandbox's exit status (77 when no namespace can be made) becomes ours.
int _runInSandbox(int argc, char** argv) {
    std::vector<std::string> args{QuorvexTest::sandboxPath(), "--sim", QuorvexTest::simulatorPath(),
                                  "--", _ownExecutable(argv[0])};
    for (int i = 1; i < argc; ++i) {
        args.emplace_back(argv[i]);
    }
    std::vector<char*> execArgs;
    execArgs.reserve(args.size() + 1);
    std::transform(args.begin(), args.end(), std::back_inserter(execArgs),
                   [](std::string& arg) { return arg.data(); });
    execArgs.push_back(nullptr);
    ::setenv("QUORVEX_IN_SANDBOX", "1", 1);
    ::execv(execArgs[0], execArgs.data());
    std::cerr << "cannot run " << args[0] << ": " << std::strerror(errno) << std::endl;
    return 1;
}

} // namespace

int main(int argc, char** argv) {
    if (!QuorvexTest::isInsideSandbox() && !_asksOnlyForTestList(argc, argv)) {
        return _runInSandbox(argc, argv);
    }
    ::testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
