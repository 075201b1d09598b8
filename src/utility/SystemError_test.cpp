#include "utility/SystemError.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <stdexcept>

namespace {

TEST(SystemError, WhatNamesTheOperationThePathAndTheErrnoText) {
    util::SystemError const error("write", "/var/adm/x", ENOSPC);
    EXPECT_STREQ("cannot write /var/adm/x: No space left on device", error.what());
}

TEST(SystemError, KeepsOperationObjectAndErrnoApart) {
    util::SystemError const error("create folder", "/a b", EACCES);
    EXPECT_EQ("create folder", error.operation());
    EXPECT_EQ("/a b", error.object());
    EXPECT_EQ(EACCES, error.errorNumber());
    EXPECT_STREQ("cannot create folder /a b: Permission denied", error.what());
}

TEST(SystemError, IsCaughtAsRuntimeError) {
    EXPECT_THROW(throw util::SystemError("read", "/x", ENOENT), std::runtime_error);
}

} // namespace
