#include "utility/Trace.h"

#include "utility/ShellCommand.h"

#include <cstdio>
#include <cstring>
#include <ctime>
#include <new>

namespace Utility {

namespace {

constexpr char gc_TimeFormat[] = "%k:%M:%S";
constexpr char gc_NoTime[] = "-----";
constexpr std::size_t gc_TextBufferSize = 255;
constexpr char gc_HostNameCommand[] = "/bin/hostname";
constexpr char gc_UnknownHostName[] = "***Unknown***.hostname.";
// Whole seconds read as milliseconds: the last three digits are always zero.
constexpr char gc_MillisecondsSuffix[] = "000";

// The current local time as text, or "-----" when it cannot be formatted.
std::string u_format_LocalTime() {
    char text[gc_TextBufferSize] = {0};
    std::time_t const now = std::time(nullptr);
    // The tool is single-threaded; localtime's shared result is read at once.
    // cppcheck-suppress localtimeCalled
    std::tm const* const local = std::localtime(&now);
    if (local == nullptr) {
        return gc_NoTime;
    }
// "%k" (hour padded with a blank) is a C library extension that the
// compiler's strict format check does not know.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat"
    std::size_t const length = std::strftime(text, sizeof text, gc_TimeFormat, local);
#pragma GCC diagnostic pop
    if (length == 0) {
        return gc_NoTime;
    }
    return text;
}

} // namespace

std::filebuf& Trace::ms_FileHandle = Trace::_get_FileHandle();

Trace::Trace(std::string const& fileName) : std::ofstream() {
    std::basic_ios<char>::rdbuf(&_get_FileHandle());
    if (!ms_IsInitialized && !fileName.empty()) {
        // Set before the open whatever its outcome: a failed open is never retried.
        // Kept for the trace's readers: see docs/compatibility.md#trace-file
        ms_IsInitialized = true;
        _open(fileName);
    }
    ++ms_ObjectCounter;
}

Trace::~Trace() {
    --ms_ObjectCounter;
    if (ms_ObjectCounter == 0 && _get_FileHandle().is_open()) {
        _get_FileHandle().close();
    }
}

std::filebuf* Trace::rdbuf() const {
    return &_get_FileHandle();
}

std::filebuf& Trace::_get_FileHandle() {
    static auto* const handle = new std::filebuf;
    return *handle;
}

void Trace::_open(std::string const& fileName) {
    // Output only: an earlier run's trace is truncated. A file that cannot be
    // created is not reported: the run's tracing is silently lost.
    // cppcheck-suppress ignoredReturnValue
    _get_FileHandle().open(fileName, std::ios::out);
}

void timeStamp(Trace& trace) {
    std::string const text = u_format_LocalTime();
    std::size_t const length = text.size();
    char* const copy = new (std::nothrow) char[length];
    if (copy == nullptr) {
        return;
    }
    // The copy holds exactly the text's bytes, without a terminating NUL, and
    // is written by its length: it is never read as a C string.
    std::memcpy(copy, text.data(), length); // NOLINT(bugprone-not-null-terminated-result)
    trace.write(copy, static_cast<std::streamsize>(length));
    delete[] copy;
}

std::string get_HostName() {
    ShellCommand hostName(gc_HostNameCommand);
    hostName.execute();
    if (!hostName.wasExecuted() || hostName.get_ReturnCode() != 0 ||
        hostName.get_stdout().empty()) {
        return std::string(gc_UnknownHostName) + gc_SiteDomainName;
    }
    return hostName.get_stdout().front();
}

// Whole seconds followed by "000". Kept for the inventory importers: see
// docs/compatibility.md#default-document
std::string get_TimeStamp() {
    char text[gc_TextBufferSize] = {0};
    std::snprintf(text, sizeof text, "%lu", static_cast<unsigned long>(std::time(nullptr)));
    return std::string(text) + gc_MillisecondsSuffix;
}

} // namespace Utility
