#pragma once
// The exception a piece of code throws, for tests that check more of it than
// its type.

#include <optional>

namespace QuorvexTest {

// The Error that work throws; none when it returns. An exception of another
// type passes through, so that the test fails on it.
template <typename Error, typename Work> std::optional<Error> thrownBy(Work const& work) {
    try {
        work();
    } catch (Error const& error) {
        return error;
    }
    return std::nullopt;
}

} // namespace QuorvexTest
