#pragma once
// A run summary written by quorvex-survey --summary, read back for checks:
// its validity against docs/summary.schema.json and the fields a test looks
// at, each given as its JSON text.

#include <nlohmann/json.hpp>

#include <string>
#include <vector>

namespace FleetTest {

class SummaryFile {
public:
    // Reads and parses the file; an unreadable or malformed file leaves an
    // empty document, which no check accepts.
    explicit SummaryFile(std::string path);

    // Empty when the document is valid against the schema, else the
    // validator's explanation.
    std::string validationProblems() const;
    // The JSON text at a JSON pointer such as "/interrupted"; "(missing)"
    // when there is nothing there.
    std::string field(std::string const& pointer) const;
    // The same within partition index of the first machine.
    std::string partitionField(std::size_t index, std::string const& pointer) const;
    // The outcome of every partition of every machine, in order.
    std::vector<std::string> outcomes() const;

private:
    std::string _path;
    nlohmann::json _document;
};

} // namespace FleetTest
