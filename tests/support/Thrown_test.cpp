#include "Thrown.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

namespace {

TEST(Thrown, GivesTheExceptionOfTheAskedType) {
    auto const error =
        QuorvexTest::thrownBy<std::runtime_error>([] { throw std::runtime_error("gone"); });
    ASSERT_TRUE(error);
    EXPECT_EQ(std::string("gone"), error->what());
}

TEST(Thrown, GivesNothingWhenTheCodeReturns) {
    EXPECT_FALSE(QuorvexTest::thrownBy<std::runtime_error>([] {}));
}

TEST(Thrown, LetsAnExceptionOfAnotherTypePass) {
    EXPECT_THROW(QuorvexTest::thrownBy<std::runtime_error>([] { throw 7; }), int);
}

} // namespace
