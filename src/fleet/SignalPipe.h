#pragma once

namespace Fleet {

// SIGINT and SIGTERM turned into bytes on a pipe that the run's poll loop
// watches, so the run reacts to them between its steps and never inside one.
class SignalPipe {
public:
    static void install();
    static int readDescriptor();
    // The first signal received so far, 0 when none; drains the pipe.
    static int takeSignal();

private:
    static void _handle(int signalNumber);
    inline static int ms_readEnd = -1;
    inline static int ms_writeEnd = -1;
    inline static int ms_firstSignal = 0;
};

} // namespace Fleet
