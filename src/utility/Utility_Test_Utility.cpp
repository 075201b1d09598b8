#include "utility/Utility_Test_Utility.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <regex>
#include <vector>

namespace Utility::Utility_Test_Utility {

namespace {

constexpr char gc_ScratchVariable[] = "QUORVEX_UTILITY_TEST_SCRATCH";
constexpr char gc_ScratchTemplate[] = "/tmp/quorvex_utility_test.XXXXXX";

} // namespace

std::string u_get_ScratchDirectory() {
    char const* const inherited = std::getenv(gc_ScratchVariable);
    if (inherited != nullptr) {
        return inherited;
    }
    std::vector<char> name(gc_ScratchTemplate, gc_ScratchTemplate + sizeof gc_ScratchTemplate);
    if (::mkdtemp(name.data()) == nullptr) {
        ADD_FAILURE() << "cannot make a scratch folder";
        return "";
    }
    ::setenv(gc_ScratchVariable, name.data(), 1);
    return name.data();
}

void u_remove_ScratchDirectory() {
    char const* const current = std::getenv(gc_ScratchVariable);
    if (current == nullptr) {
        return;
    }
    std::error_code ignored;
    std::filesystem::remove_all(current, ignored);
    ::unsetenv(gc_ScratchVariable);
}

void u_run_InFreshProcess(std::function<int()> const& body) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(std::exit(body()), ::testing::ExitedWithCode(0), "");
}

std::string u_normalise_TemporaryNames(std::string const& text) {
    static std::regex const temporaryName("/tmp/ShellCommand\\.[A-Za-z0-9]{6}");
    return std::regex_replace(text, temporaryName, "/tmp/ShellCommand.XXXXXX");
}

} // namespace Utility::Utility_Test_Utility
