#pragma once

#include "TraceCapture.h"

#include <gtest/gtest.h>

namespace QuorvexTest {

// A test whose process trace is open before anything runs, and which reads
// only what it caused.
class TracedTest : public ::testing::Test {
protected:
    TraceRecorder _trace;
};

} // namespace QuorvexTest
