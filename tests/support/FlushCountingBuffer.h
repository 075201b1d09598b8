#pragma once

#include <sstream>

namespace QuorvexTest {

// A string buffer that counts the flushes reaching it.
class FlushCountingBuffer : public std::stringbuf {
public:
    int flushes() const { return _flushes; }

protected:
    int sync() override {
        ++_flushes;
        return std::stringbuf::sync();
    }

private:
    int _flushes = 0;
};

} // namespace QuorvexTest
