#pragma once

#include "estate/ConsoleRecord.h"

#include <stdexcept>
#include <string>
#include <vector>

namespace estate {

// A file of the collect folder that is there but says something the estate
// cannot take (not JSON, a missing member, a console recorded twice): what
// and where, in one line.
class MalformedInput : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// records.json of a collect folder: when the collection ran, and exactly one
// record per console of the inventory, in the file's order.
struct CollectRecords {
    std::string collected;
    std::vector<ConsoleRecord> consoles;
};

// The schema version of records.json (and of bundle.json) this program reads.
inline constexpr int gc_RecordsSchemaVersion = 1;

// Reads records.json from its text; path names it in messages. Throws
// MalformedInput when the text is not such a file.
CollectRecords parseCollectRecords(std::string const& text, std::string const& path);

// Reads <collectFolder>/records.json. Throws util::SystemError when it cannot
// be read, MalformedInput when it is not such a file.
CollectRecords readCollectRecords(std::string const& collectFolder);

} // namespace estate
