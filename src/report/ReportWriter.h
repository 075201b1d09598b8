#pragma once

#include <nlohmann/json.hpp>

#include <string>

namespace report {

// Writes the report of a summary into folder (made when missing):
// index.html, partitions.csv and summary.json, each through a temporary
// name renamed when complete, and a copy of each document the summary names
// from vpdFolder in folder/documents, where the page links to them: the
// folder holds all the page needs wherever it is copied. Throws util::SystemError
// when the folder cannot be made or a file cannot be written.
void writeReport(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                 std::string const& folder);

} // namespace report
