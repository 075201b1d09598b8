#include "SummaryFile.h"

#include "QuorvexTest.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace FleetTest {

namespace {

constexpr char gc_Python[] = QUORVEX_PYTHON;
constexpr char gc_Validator[] = QUORVEX_FLEET_SUMMARY_VALIDATOR;

} // namespace

SummaryFile::SummaryFile(std::string path) : _path(std::move(path)) {
    if (QuorvexTest::fileExists(_path)) {
        _document = nlohmann::json::parse(QuorvexTest::readFile(_path), nullptr, false);
    }
    if (_document.is_discarded()) {
        _document = nlohmann::json();
    }
}

std::string SummaryFile::validationProblems() const {
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand(
        {gc_Python, gc_Validator, QuorvexTest::sourceRoot() + "/docs/summary.schema.json", _path});
    return result.exitStatus == 0 ? "" : result.stdoutText + result.stderrText;
}

std::string SummaryFile::field(std::string const& pointer) const {
    nlohmann::json::json_pointer const at(pointer);
    return _document.contains(at) ? _document.at(at).dump() : "(missing)";
}

std::string SummaryFile::partitionField(std::size_t index, std::string const& pointer) const {
    return field("/machines/0/partitions/" + std::to_string(index) + pointer);
}

std::vector<std::string> SummaryFile::outcomes() const {
    std::vector<std::string> found;
    if (!_document.is_object() || !_document.contains("machines")) {
        return found;
    }
    for (auto const& machine : _document["machines"]) {
        nlohmann::json const partitions = machine.value("partitions", nlohmann::json::array());
        std::transform(
            partitions.begin(), partitions.end(), std::back_inserter(found),
            [](nlohmann::json const& partition) { return partition.value("outcome", "(none)"); });
    }
    return found;
}

} // namespace FleetTest
