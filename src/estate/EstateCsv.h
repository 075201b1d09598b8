#pragma once

#include "estate/ConsoleRun.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace estate {

// estate.csv, written console by console: the report's partitions.csv of
// every console one after the other, in the estate's order, each row led by
// the console's columns (console, record, record_message, console_host). A
// console without rows (not collected, or a run without machines) has one
// row of its own with every other field empty, so that each console is in
// the file. Written as partitions.csv is: RFC 4180, CRLF, UTF-8.
class EstateCsv {
public:
    EstateCsv();

    void add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary);

    // The text added since it was last taken, header first, leaving nothing
    // behind: the estate writes it console by console, so that the whole
    // file (36 MB at 200,000 partitions) is never held.
    std::string takeText();

private:
    std::string _text;
    std::size_t _partitionColumns = 0;
};

} // namespace estate
