// The reading of a command's captured output, on a file holding arbitrary
// bytes (an anonymous in-memory file, reached by its /proc path).

#include "Fuzz_Utility.h"

#include "utility/ShellCommand.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace {

// Entries of an earlier run, which a read appends to and never replaces.
std::vector<std::string> const gc_EarlierLines = {"earlier", ""};

int u_get_File() {
    static int const file = memfd_create("captured-output", 0);
    Fuzz_Utility::u_require(file >= 0, "an in-memory file can be made");
    return file;
}

std::string u_write_File(std::string const& contents) {
    int const file = u_get_File();
    Fuzz_Utility::u_require(ftruncate(file, 0) == 0 &&
                                pwrite(file, contents.data(), contents.size(), 0) ==
                                    static_cast<ssize_t>(contents.size()),
                            "the in-memory file can be written");
    return "/proc/self/fd/" + std::to_string(file);
}

void u_check_Entries(std::string const& contents, std::vector<std::string> const& lines) {
    std::vector<std::string> const added(
        lines.begin() + static_cast<std::ptrdiff_t>(gc_EarlierLines.size()), lines.end());
    std::size_t const lineEnds =
        static_cast<std::size_t>(std::count(contents.begin(), contents.end(), '\n'));
    Fuzz_Utility::u_require(!added.empty() && added.size() <= lineEnds + 1,
                            "at least one and at most line ends + 1 entries", contents);
    for (std::string const& entry : added) {
        Fuzz_Utility::u_require(entry.size() <= Fuzz_Utility::gc_MaximumLineLength &&
                                    entry.find('\n') == std::string::npos &&
                                    entry.find('\0') == std::string::npos,
                                "an entry is one line of at most 65533 characters", entry);
    }
    Fuzz_Utility::u_require(added == Fuzz_Utility::u_expected_Lines(contents),
                            "the entries are the file's lines and the final read", contents);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    std::string const contents(reinterpret_cast<char const*>(data), size);
    std::string const fileName = u_write_File(contents);
    std::vector<std::string> lines = gc_EarlierLines;
    unsigned int const count = Utility::ShellCommand::_readOutput(fileName, lines);
    Fuzz_Utility::u_require(count == lines.size(), "the count is the number of entries", contents);
    Fuzz_Utility::u_require(
        std::equal(gc_EarlierLines.begin(), gc_EarlierLines.end(), lines.begin()),
        "earlier entries stay", contents);
    u_check_Entries(contents, lines);
    return 0;
}
