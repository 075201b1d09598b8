#include "estate/Estate.h"

#include "estate/CollectRecords.h"

#include <algorithm>
#include <cstdio>

namespace estate {

namespace {

std::size_t shownPlace(RecordKind kind) {
    auto const& table = recordTable();
    return static_cast<std::size_t>(
        std::find_if(table.begin(), table.end(),
                     [kind](RecordText const& row) { return row.kind == kind; }) -
        table.begin());
}

bool isKeptAsItIs(char character, std::size_t position) {
    bool const letterOrDigit = (character >= 'a' && character <= 'z') ||
                               (character >= 'A' && character <= 'Z') ||
                               (character >= '0' && character <= '9');
    return letterOrDigit || character == '-' || (character == '.' && position > 0);
}

} // namespace

Estate readEstate(std::string const& collectFolder) {
    CollectRecords const records = readCollectRecords(collectFolder);
    Estate estate;
    estate.collected = records.collected;
    for (ConsoleRecord const& record : records.consoles) {
        estate.consoles.push_back(readConsoleRun(collectFolder, record));
    }
    std::stable_sort(estate.consoles.begin(), estate.consoles.end(),
                     [](ConsoleRun const& a, ConsoleRun const& b) {
                         std::size_t const placeA = shownPlace(a.record.kind);
                         std::size_t const placeB = shownPlace(b.record.kind);
                         return placeA != placeB ? placeA < placeB
                                                 : a.record.console < b.record.console;
                     });
    return estate;
}

std::string consoleFolderName(std::string const& console) {
    std::string name;
    for (std::size_t i = 0; i < console.size(); ++i) {
        if (isKeptAsItIs(console[i], i)) {
            name += console[i];
            continue;
        }
        char escaped[4] = {};
        std::snprintf(escaped, sizeof escaped, "_%02x", static_cast<unsigned char>(console[i]));
        name += escaped;
    }
    return name.empty() ? "_" : name;
}

std::optional<std::string> consoleReportPath(ConsoleRun const& console) {
    if (!console.hasSummary()) {
        return std::nullopt;
    }
    return "consoles/" + consoleFolderName(console.record.console) + "/index.html";
}

} // namespace estate
