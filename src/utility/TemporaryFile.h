#pragma once

#include <string>

namespace Utility {

// An empty file with a unique name, made from a path prefix plus six generated
// characters. The file stays on disk until remove() succeeds; the destructor
// never deletes it.
class TemporaryFile {
public:
    // Told the name of each file right after it is made (made true) and
    // right before it is deleted (made false). The one-machine tool leaves it
    // unset; quorvex-survey's workers set it, so that the run can remove what
    // a worker killed midway leaves behind.
    using Observer = void (*)(std::string const& name, bool made);
    static Observer ms_Observer;

    // Creates baseFileName + ".XXXXXX" with the six X replaced; on failure the
    // object stays invalid and nothing is reported.
    explicit TemporaryFile(std::string const& baseFileName);
    TemporaryFile(TemporaryFile const& other) = default;
    TemporaryFile& operator=(TemporaryFile const& other) = default;
    ~TemporaryFile() = default;

    bool isValid() const;
    std::string get_ActualFileName() const;
    std::string get_BaseFileName() const;

    // Deletes the file. Only when the object is valid and the deletion
    // succeeds are both names emptied and the object made invalid.
    bool remove();

private:
    // A command reads its output files by name without copies of the names.
    friend class ShellCommand;

    std::string const& _get_ActualFileName() const;

    std::string _baseFileName;
    std::string _actualFileName;
    bool _valid{false};
};

} // namespace Utility
