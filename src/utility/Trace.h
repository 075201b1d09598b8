#pragma once

#include <fstream>
#include <string>

namespace Utility {

// The site's domain name, appended to the fallback host name. A site setting:
// the program has no way to learn it, so it is empty unless a site sets it here.
inline constexpr char gc_SiteDomainName[] = "";

// An output stream on the one trace file of the process. Every trace object
// writes into the same shared file buffer; the first object with a non-empty
// file name opens (and truncates) the file, later names are ignored, and the
// file is closed when the last trace object goes.
//
// Text written through an object before the file is open is lost, and that
// object stays in its failed state; nothing must be traced before main has
// opened the file.
class Trace : public std::ofstream {
public:
    explicit Trace(std::string const& fileName);
    ~Trace() override;
    // A copy would be neither bound to the shared file nor counted.
    Trace(Trace const&) = delete;
    Trace& operator=(Trace const&) = delete;

    // The shared file buffer, not the stream's own unused one.
    std::filebuf* rdbuf() const;

    // The shared trace file: the buffer every trace object writes into.
    static std::filebuf& ms_FileHandle;
    // Set once a trace object with a non-empty file name has tried to open the file.
    // Constant-initialised, like the counter, so both are valid before any
    // start-up code runs.
    inline static bool ms_IsInitialized = false;
    // Number of live trace objects; the file is closed when it drops to 0.
    inline static int ms_ObjectCounter = 0;

private:
    // Never destroyed, so trace objects may be built and destroyed in any
    // order relative to it.
    static std::filebuf& _get_FileHandle();
    void _open(std::string const& fileName);
};

// Writes the current local time as "%k:%M:%S" (hour padded with a blank,
// 24-hour clock), or "-----" when it cannot be formatted. No line end.
void timeStamp(Trace& trace);

// The console's host name: the first line of "/bin/hostname", or
// "***Unknown***.hostname." + gc_SiteDomainName when that fails.
std::string get_HostName();

// The current time in whole seconds since the epoch followed by "000".
std::string get_TimeStamp();

} // namespace Utility
