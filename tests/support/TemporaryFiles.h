#pragma once
// Temporary folders and the exact bytes of files.

#include <string>
#include <vector>

namespace QuorvexTest {

// A fresh folder under $TMPDIR (or /tmp), removed with all its content when
// the object goes away.
class TemporaryDirectory {
public:
    TemporaryDirectory();
    ~TemporaryDirectory();
    TemporaryDirectory(TemporaryDirectory const&) = delete;
    TemporaryDirectory& operator=(TemporaryDirectory const&) = delete;

    std::string const& path() const;
    // path() + "/" + name
    std::string file(std::string const& name) const;

private:
    std::string _path;
};

// A scratch folder for one test that survives the test program being started
// afresh (see runInFreshProcess): the fresh copy finds the folder of the copy
// that started it through the environment, so both sides see the same files.
// removeScratchDirectory() removes it and forgets it.
std::string scratchDirectory();
void removeScratchDirectory();

// The exact bytes of a file; throws util::SystemError (a std::runtime_error)
// when it cannot be read.
std::string readFile(std::string const& path);
// Creates or truncates the file and writes the text as it is; throws
// std::runtime_error on failure.
void writeFile(std::string const& path, std::string const& text);
bool fileExists(std::string const& path);

// The names of the entries of a folder, sorted; empty when it cannot be read.
std::vector<std::string> listFolder(std::string const& folder);
// Removes every entry of a folder, the folder itself staying.
void clearFolder(std::string const& folder);

} // namespace QuorvexTest
