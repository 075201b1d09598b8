// The report subcommand alone, for the report tests.
#include "report/ReportCommand.h"

#include <CLI/CLI.hpp>

#include <exception>
#include <iostream>

int main(int argc, char** argv) {
    try {
        CLI::App app{"report", "quorvex-survey"};
        report::ReportRequest request;
        report::addReportSubcommand(app, request);
        app.require_subcommand(1);
        CLI11_PARSE(app, argc, argv);
        return report::runReportSubcommand(request, std::cout, std::cerr);
    } catch (std::exception const& failure) {
        std::cerr << "report: " << failure.what() << "\n";
        return 1;
    }
}
