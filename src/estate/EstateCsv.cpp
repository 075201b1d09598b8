#include "estate/EstateCsv.h"

#include "report/PartitionsCsv.h"

#include <utility>

namespace estate {

EstateCsv::EstateCsv() {
    std::vector<std::string> header = {"console", "record", "record_message", "console_host"};
    std::vector<std::string> const partitionHeader = report::partitionsCsvHeader();
    header.insert(header.end(), partitionHeader.begin(), partitionHeader.end());
    _partitionColumns = partitionHeader.size();
    report::appendCsvRow(_text, header);
}

void EstateCsv::add(ConsoleRun const& console,
                    std::optional<nlohmann::ordered_json> const& summary) {
    std::vector<std::string> const leading = {console.record.console,
                                              textOf(console.record.kind).name,
                                              console.record.message, console.consoleHost};
    report::CsvRows const rows = summary ? report::partitionsCsvRows(*summary) : report::CsvRows();
    if (rows.empty()) {
        std::vector<std::string> row = leading;
        row.resize(leading.size() + _partitionColumns);
        report::appendCsvRow(_text, row);
        return;
    }
    for (std::vector<std::string> const& partition : rows) {
        std::vector<std::string> row = leading;
        row.insert(row.end(), partition.begin(), partition.end());
        report::appendCsvRow(_text, row);
    }
}

std::string EstateCsv::takeText() {
    return std::exchange(_text, std::string());
}

} // namespace estate
