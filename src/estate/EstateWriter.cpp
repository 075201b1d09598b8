#include "estate/EstateWriter.h"

#include "estate/EstateCsv.h"
#include "estate/EstateDocument.h"
#include "estate/EstatePage.h"
#include "estate/EstateRows.h"
#include "estate/EstateTotals.h"
#include "report/ReportWriter.h"
#include "utility/AtomicFile.h"
#include "utility/AtomicFileWriter.h"
#include "utility/SystemError.h"

#include <filesystem>
#include <system_error>
#include <utility>

namespace estate {

namespace {

void makeFolder(std::string const& folder) {
    std::error_code failure;
    std::filesystem::create_directories(folder, failure);
    if (failure) {
        throw util::SystemError("create", folder, failure.value());
    }
}

// Every output of the estate, gathered console by console; estate.csv goes
// to its file as it comes.
struct EstateOutputs {
    explicit EstateOutputs(std::string const& folder) : csvFile(folder + "/estate.csv") {}

    EstateTotals totals;
    EstateDocument document;
    EstateCsv csv;
    util::AtomicFileWriter csvFile;
    EstateRows rows;
    EstatePage page;
};

void addConsole(EstateOutputs& outputs, ConsoleRun console, std::string const& folder,
                EstateHistory& history) {
    std::optional<nlohmann::ordered_json> summary = readSummary(console);
    if (summary) {
        std::optional<report::SinceLastRun> const since = history.record(console, *summary);
        if (since) {
            console.changes = changesOf(*since);
        }
        report::writeReport(*summary, console.vpdFolder,
                            folder + "/consoles/" + consoleFolderName(console.record.console),
                            since, report::DocumentPlacement::link);
    }
    outputs.totals.add(console, summary);
    outputs.document.add(console, summary);
    outputs.csv.add(console, summary);
    outputs.csvFile.append(outputs.csv.takeText());
    outputs.rows.add(console, summary);
    outputs.page.add(console, summary);
}

} // namespace

void writeEstate(Estate const& estate, std::string const& folder, EstateHistory& history) {
    makeFolder(folder);
    EstateOutputs outputs(folder);
    for (ConsoleRun const& console : estate.consoles) {
        addConsole(outputs, console, folder, history);
    }
    nlohmann::ordered_json const totals = outputs.totals.document();
    // Each text is taken out and dropped once written: at 200,000 partitions
    // the outputs held together would double the estate's memory.
    util::writeFileAtomically(folder + "/estate.json",
                              std::move(outputs.document).text(estate.collected, totals));
    // What is not taken yet: the header alone when there was no console.
    outputs.csvFile.append(outputs.csv.takeText());
    outputs.csvFile.commit();
    util::writeFileAtomically(folder + "/index.html",
                              outputs.page.text(estate, totals, outputs.rows.scriptText()));
}

} // namespace estate
