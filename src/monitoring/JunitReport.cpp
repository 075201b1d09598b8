#include "monitoring/JunitReport.h"

#include "monitoring/SecondsText.h"
#include "report/ListingFailure.h"
#include "report/Outcome.h"
#include "utility/TextSafety.h"

#include <pugixml.hpp>

#include <map>
#include <sstream>
#include <variant>

namespace monitoring {

namespace {

constexpr char gc_Replacement[] = "\xEF\xBF\xBD";
constexpr char gc_PartitionListing[] = "partition listing";
constexpr char gc_MachineListing[] = "machine listing";

// XML 1.0 allows no control character but tab, line feed and carriage
// return, not even as a character reference.
std::string xmlText(std::string const& text) {
    std::string result;
    for (char const c : util::validUtf8(text)) {
        bool const control = static_cast<unsigned char>(c) < 0x20 || c == '\x7f';
        if (control && c != '\t' && c != '\n' && c != '\r') {
            result += gc_Replacement;
        } else {
            result += c;
        }
    }
    return result;
}

void setAttribute(pugi::xml_node node, char const* name, std::string const& value) {
    node.append_attribute(name).set_value(xmlText(value).c_str());
}

// The counts a suite and the whole file carry.
struct CaseCounts {
    long long tests = 0;
    long long failures = 0;
    long long skipped = 0;
    double seconds = 0;

    void add(CaseCounts const& other) {
        tests += other.tests;
        failures += other.failures;
        skipped += other.skipped;
        seconds += other.seconds;
    }
};

void setCounts(pugi::xml_node node, CaseCounts const& counts) {
    setAttribute(node, "tests", std::to_string(counts.tests));
    setAttribute(node, "failures", std::to_string(counts.failures));
    // Every partition ends failed, skipped or passed: none is an error.
    setAttribute(node, "errors", "0");
    setAttribute(node, "skipped", std::to_string(counts.skipped));
    setAttribute(node, "time", secondsText(counts.seconds));
}

pugi::xml_node addCase(pugi::xml_node suite, std::string const& classname, std::string const& name,
                       double time) {
    pugi::xml_node testcase = suite.append_child("testcase");
    setAttribute(testcase, "classname", classname);
    setAttribute(testcase, "name", name);
    setAttribute(testcase, "time", secondsText(time));
    return testcase;
}

void addFailure(pugi::xml_node testcase, std::string const& type, std::string const& reason) {
    pugi::xml_node failure = testcase.append_child("failure");
    setAttribute(failure, "message", reason);
    setAttribute(failure, "type", type);
    failure.text().set(xmlText(reason).c_str());
}

// How a partition's case ends: counted, and its <failure> or <skipped>.
void addEnding(pugi::xml_node testcase, report::PartitionSummary const& partition,
               CaseCounts& counts) {
    report::Outcome const outcome = partition.outcome;
    if (outcome == report::Outcome::Inactive || outcome == report::Outcome::Interrupted) {
        ++counts.skipped;
        setAttribute(testcase.append_child("skipped"), "message",
                     std::string(report::textOf(outcome).label) + ": " + partition.statusText);
    } else if (report::isFailure(outcome)) {
        ++counts.failures;
        addFailure(testcase, report::outcomeName(outcome),
                   partition.reason.value_or(partition.statusText));
    }
}

// The host as listed; a host listed again on the machine is "<host> #2"
// and on, as the history names it; a partition without host name goes by
// its identity, as the progress line shows it.
std::string caseName(std::string const& machine, report::PartitionSummary const& partition,
                     std::map<std::string, int>& seen) {
    std::string const name =
        partition.host.empty() ? machine + "-" + partition.id.value_or("") : partition.host;
    int const times = ++seen[name];
    return times == 1 ? name : name + " #" + std::to_string(times);
}

CaseCounts addMachine(pugi::xml_node suites, report::MachineSummary const& machine,
                      std::string const& console) {
    pugi::xml_node suite = suites.append_child("testsuite");
    setAttribute(suite, "name", machine.identity);
    CaseCounts counts;
    std::map<std::string, int> seen;
    for (report::PartitionSummary const& partition : machine.partitions) {
        double const time = partition.seconds.value_or(0);
        pugi::xml_node testcase =
            addCase(suite, machine.identity, caseName(machine.identity, partition, seen), time);
        ++counts.tests;
        counts.seconds += time;
        addEnding(testcase, partition, counts);
    }
    if (machine.listingFailure) {
        addFailure(addCase(suite, machine.identity, gc_PartitionListing, 0),
                   report::gc_ListingFailedName,
                   report::listingFailureText(*machine.listingFailure));
        ++counts.tests;
        ++counts.failures;
    }
    setCounts(suite, counts);
    setAttribute(suite, "hostname", console);
    return counts;
}

CaseCounts addConsoleListing(pugi::xml_node suites, report::ListingFailure const& failure,
                             std::string const& console) {
    pugi::xml_node suite = suites.append_child("testsuite");
    setAttribute(suite, "name", gc_MachineListing);
    addFailure(addCase(suite, gc_MachineListing, console, 0), report::gc_ListingFailedName,
               report::listingFailureText(failure));
    CaseCounts const counts{1, 1, 0, 0};
    setCounts(suite, counts);
    setAttribute(suite, "hostname", console);
    return counts;
}

double elapsedOf(report::RunSummary const& summary) {
    return std::visit([](auto value) { return static_cast<double>(value); },
                      summary.elapsedSeconds);
}

} // namespace

std::string junitText(report::RunSummary const& summary) {
    pugi::xml_document document;
    pugi::xml_node declaration = document.append_child(pugi::node_declaration);
    declaration.append_attribute("version").set_value("1.0");
    declaration.append_attribute("encoding").set_value("UTF-8");
    pugi::xml_node suites = document.append_child("testsuites");
    setAttribute(suites, "name", summary.tool);
    CaseCounts total;
    for (report::MachineSummary const& machine : summary.machines) {
        total.add(addMachine(suites, machine, summary.consoleHost));
    }
    if (summary.listingFailure) {
        total.add(addConsoleListing(suites, *summary.listingFailure, summary.consoleHost));
    }
    setCounts(suites, total);
    // The run's own time: partitions ran side by side.
    suites.attribute("time").set_value(secondsText(elapsedOf(summary)).c_str());
    setAttribute(suites, "timestamp", summary.started);
    std::ostringstream text;
    document.save(text, "  ", pugi::format_indent, pugi::encoding_utf8);
    return text.str();
}

} // namespace monitoring
