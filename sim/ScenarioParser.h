#pragma once
// Reads a scenario file line by line into a Scenario, rejecting anything it
// does not understand with the line number and the problem.

#include "Scenario.h"

#include <set>
#include <string>
#include <vector>

namespace PylonSim {

class ScenarioParser {
public:
    explicit ScenarioParser(std::string const& fileName);

    // Throws ScenarioError.
    Scenario parse();

private:
    enum class Stream { Stdout, Stderr, Document };

    void _readFile();
    void _parseLine(std::string const& line);
    void _openSection(std::string const& line);
    void _closeSection();
    void _parseExitCode(std::string const& value);
    void _parseDelay(std::string const& value);
    void _parseChildDelay(std::string const& value);
    void _parseDaemonDelay(std::string const& value);
    void _parseMisbehaviour(std::string const& value);
    void _parseDocumentReplacement(std::string const& value);
    double _parseSeconds(std::string const& key, std::string const& value);
    void _parseText(std::string const& key, std::string const& value);
    void _requireOnce(std::string const& key);
    std::string _readBlock(std::string const& terminator);
    std::string _readTextFile(std::string const& path) const;
    std::string& _target(Stream stream);
    [[noreturn]] void _fail(std::string const& problem) const;

    std::string _fileName;
    std::vector<std::string> _lines;
    std::size_t _index = 0; // of the line being parsed
    Scenario _scenario;

    // The section being filled; its tool is empty before the first header.
    std::string _tool;
    std::string _name;
    Response _response;
    std::set<std::string> _keysSeen;
};

} // namespace PylonSim
