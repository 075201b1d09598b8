#include "Scenario.h"

#include "ScenarioParser.h"

namespace PylonSim {

namespace {

std::string _sectionKey(std::string const& tool, std::string const& name) {
    return tool + '\n' + name;
}

} // namespace

std::string ScenarioError::describe() const {
    return line == 0 ? fileName + ": " + problem
                     : fileName + ":" + std::to_string(line) + ": " + problem;
}

Scenario Scenario::load(std::string const& fileName) {
    return ScenarioParser(fileName).parse();
}

Response Scenario::find(std::string const& tool, std::string const& name) const {
    auto found = _sections.find(_sectionKey(tool, name));
    if (found == _sections.end()) {
        found = _sections.find(_sectionKey(tool, "*"));
    }
    return found == _sections.end() ? Response() : found->second;
}

double Scenario::get_DefaultDelay() const {
    return _defaultDelay;
}

void Scenario::_insert(std::string const& tool, std::string const& name, Response const& response) {
    _sections.emplace(_sectionKey(tool, name), response);
}

bool Scenario::_contains(std::string const& tool, std::string const& name) const {
    return _sections.count(_sectionKey(tool, name)) != 0;
}

} // namespace PylonSim
