#include "ScenarioParser.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>

namespace PylonSim {

namespace {

constexpr char const* gc_Tools[] = {"lsvtc", "lspartition", "runCmdOnPartition",
                                    "getFileFromPartition", "putFileToPartition"};
constexpr double gc_MaximumDelay = 3600.0;
constexpr int gc_MaximumExitCode = 255;

// An empty file leaves the copy failed; that is still an empty text.
std::string _readAll(std::ifstream& in) {
    std::ostringstream content;
    content << in.rdbuf();
    return content.str();
}

bool _isKnownTool(std::string const& tool) {
    return std::any_of(std::begin(gc_Tools), std::end(gc_Tools),
                       [&tool](char const* known) { return tool == known; });
}

bool _isBlankOrComment(std::string const& line) {
    std::size_t const first = line.find_first_not_of(" \t\r");
    return first == std::string::npos || line[first] == '#';
}

std::string _trimmed(std::string const& text) {
    std::size_t const first = text.find_first_not_of(" \t\r");
    if (first == std::string::npos) {
        return "";
    }
    return text.substr(first, text.find_last_not_of(" \t\r") - first + 1);
}

std::string _directoryOf(std::string const& fileName) {
    std::size_t const slash = fileName.rfind('/');
    return slash == std::string::npos ? "." : fileName.substr(0, slash);
}

// A block terminator is a word of letters, digits and "_".
bool _isBlockStart(std::string const& value) {
    if (value.size() < 3 || value.compare(0, 2, "<<") != 0) {
        return false;
    }
    return value.find_first_not_of(
               "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_", 2) ==
           std::string::npos;
}

} // namespace

ScenarioParser::ScenarioParser(std::string const& fileName) : _fileName(fileName) {}

Scenario ScenarioParser::parse() {
    _readFile();
    for (_index = 0; _index < _lines.size(); ++_index) {
        _parseLine(_lines[_index]);
    }
    _closeSection();
    return _scenario;
}

void ScenarioParser::_readFile() {
    std::error_code ignored;
    std::ifstream in(_fileName, std::ios::binary);
    if (!in.is_open() || std::filesystem::is_directory(_fileName, ignored)) {
        throw ScenarioError{_fileName, 0, "cannot read the scenario file"};
    }
    std::istringstream lines(_readAll(in));
    std::string line;
    while (std::getline(lines, line)) {
        _lines.push_back(line);
    }
}

void ScenarioParser::_parseLine(std::string const& line) {
    if (_isBlankOrComment(line)) {
        return;
    }
    if (line[0] == '[') {
        _openSection(line);
        return;
    }
    std::size_t const separator = line.find_first_of(" \t");
    std::string const key = line.substr(0, separator);
    std::string const value = separator == std::string::npos ? "" : line.substr(separator + 1);
    if (key == "exit") {
        _parseExitCode(value);
        return;
    }
    if (key == "delay") {
        _parseDelay(value);
        return;
    }
    if (key == "child-delay") {
        _parseChildDelay(value);
        return;
    }
    if (key == "daemon-delay") {
        _parseDaemonDelay(value);
        return;
    }
    if (key == "misbehave") {
        _parseMisbehaviour(value);
        return;
    }
    if (key == "document-replace") {
        _parseDocumentReplacement(value);
        return;
    }
    _parseText(key, value);
}

void ScenarioParser::_openSection(std::string const& line) {
    std::string const header = _trimmed(line);
    if (header.back() != ']') {
        _fail("section header must end with \"]\"");
    }
    std::string const inside = _trimmed(header.substr(1, header.size() - 2));
    std::size_t const blank = inside.find_first_of(" \t");
    std::string const tool = inside.substr(0, blank);
    std::string const name = blank == std::string::npos ? "" : _trimmed(inside.substr(blank));
    if (!_isKnownTool(tool)) {
        _fail("unknown section \"" + tool +
              "\" (expected lsvtc, lspartition, runCmdOnPartition, getFileFromPartition or "
              "putFileToPartition)");
    }
    if (tool == "lsvtc" && !name.empty()) {
        _fail("section [lsvtc] takes no name");
    }
    if (tool != "lsvtc" && name.empty()) {
        _fail("section [" + tool + "] needs a name, or \"*\" for the default");
    }
    _closeSection();
    if (_scenario._contains(tool, name)) {
        _fail("section [" + inside + "] appears twice");
    }
    _tool = tool;
    _name = name;
}

void ScenarioParser::_closeSection() {
    if (!_tool.empty()) {
        _scenario._insert(_tool, _name, _response);
    }
    _response = Response();
    _keysSeen.clear();
}

void ScenarioParser::_parseExitCode(std::string const& value) {
    _requireOnce("exit");
    if (_tool.empty()) {
        _fail("\"exit\" must follow a section header");
    }
    std::string const text = _trimmed(value);
    char* end = nullptr;
    errno = 0;
    long const code = std::strtol(text.c_str(), &end, 10);
    if (text.empty() || *end != '\0' || errno != 0 || code < 0 || code > gc_MaximumExitCode) {
        _fail("exit code must be a whole number from 0 to 255, not \"" + text + "\"");
    }
    _response.exitCode = static_cast<int>(code);
}

// Seconds for "delay", "child-delay" or "daemon-delay": a number from 0 to 3600.
double ScenarioParser::_parseSeconds(std::string const& key, std::string const& value) {
    _requireOnce(key);
    std::string const text = _trimmed(value);
    char* end = nullptr;
    double const seconds = std::strtod(text.c_str(), &end);
    if (text.empty() || *end != '\0' || !std::isfinite(seconds) || seconds < 0.0 ||
        seconds > gc_MaximumDelay || text.find_first_of("xXnN") != std::string::npos) {
        _fail(key + " must be a number of seconds from 0 to 3600, not \"" + text + "\"");
    }
    return seconds;
}

// Before the first section header the delay applies to every section.
void ScenarioParser::_parseDelay(std::string const& value) {
    double const seconds = _parseSeconds("delay", value);
    if (_tool.empty()) {
        _scenario._defaultDelay = seconds;
        return;
    }
    _response.delay = seconds;
}

void ScenarioParser::_parseChildDelay(std::string const& value) {
    double const seconds = _parseSeconds("child-delay", value);
    if (_tool.empty()) {
        _fail("\"child-delay\" must follow a section header");
    }
    _response.childDelay = seconds;
}

void ScenarioParser::_parseDaemonDelay(std::string const& value) {
    double const seconds = _parseSeconds("daemon-delay", value);
    if (_tool.empty()) {
        _fail("\"daemon-delay\" must follow a section header");
    }
    _response.daemonDelay = seconds;
}

// Several misbehaviours may be given, one per line.
void ScenarioParser::_parseMisbehaviour(std::string const& value) {
    std::string const name = _trimmed(value);
    if (_tool.empty()) {
        _fail("\"misbehave\" must follow a section header");
    }
    if (name != "ignore-signals" && name != "close-stdout" && name != "rename" &&
        name != "fork-storm" && name != "stop-self") {
        _fail("unknown misbehaviour \"" + name +
              "\" (expected ignore-signals, close-stdout, rename, fork-storm or stop-self)");
    }
    _response.misbehaviours.insert(name);
}

// "document-replace /OLD/NEW/": the first character delimits OLD and NEW,
// so that one document file serves runs that differ in a serial number or a
// code level. Every occurrence in the document given so far is replaced.
void ScenarioParser::_parseDocumentReplacement(std::string const& value) {
    if (_tool != "getFileFromPartition") {
        _fail("\"document-replace\" belongs in a [getFileFromPartition ...] section");
    }
    std::size_t const middle = value.empty() ? std::string::npos : value.find(value[0], 1);
    std::size_t const end = middle == std::string::npos ? middle : value.find(value[0], middle + 1);
    if (value.size() < 3 || end != value.size() - 1 || middle == 1) {
        _fail("document-replace takes /OLD/NEW/: a delimiter, a text to find, the delimiter, "
              "its replacement and the delimiter, not \"" +
              value + "\"");
    }
    if (!_response.document) {
        _fail("\"document-replace\" must follow the document it changes");
    }
    std::string const old = value.substr(1, middle - 1);
    std::string const replacement = value.substr(middle + 1, end - middle - 1);
    std::string& document = *_response.document;
    for (std::size_t at = document.find(old); at != std::string::npos;
         at = document.find(old, at + replacement.size())) {
        document.replace(at, old.size(), replacement);
    }
}

void ScenarioParser::_parseText(std::string const& key, std::string const& value) {
    std::size_t const dash = key.find('-');
    std::string const streamName = key.substr(0, dash);
    std::string const formName = dash == std::string::npos ? "" : key.substr(dash + 1);
    Stream stream = Stream::Stdout;
    if (streamName == "stderr") {
        stream = Stream::Stderr;
    } else if (streamName == "document") {
        stream = Stream::Document;
    } else if (streamName != "stdout") {
        _fail("unknown key \"" + key +
              "\" (expected stdout, stderr, document, their -nolf and -file forms, "
              "document-replace, exit, delay, child-delay, daemon-delay or misbehave)");
    }
    if (formName != "" && formName != "nolf" && formName != "file") {
        _fail("unknown key \"" + key + "\" (a text key ends in nothing, -nolf or -file)");
    }
    if (_tool.empty()) {
        _fail("\"" + key + "\" must follow a section header");
    }
    if (stream == Stream::Document && _tool != "getFileFromPartition") {
        _fail("\"" + key + "\" belongs in a [getFileFromPartition ...] section");
    }
    std::string& target = _target(stream);
    if (formName == "file") {
        target += _readTextFile(value);
    } else if (formName == "nolf") {
        target += value;
    } else if (_isBlockStart(value)) {
        target += _readBlock(value.substr(2));
    } else {
        target += value + '\n';
    }
}

void ScenarioParser::_requireOnce(std::string const& key) {
    if (!_keysSeen.insert(key).second) {
        _fail("\"" + key + "\" is given twice in this section");
    }
}

std::string ScenarioParser::_readBlock(std::string const& terminator) {
    std::size_t const start = _index;
    std::string text;
    for (++_index; _index < _lines.size(); ++_index) {
        if (_lines[_index] == terminator) {
            return text;
        }
        text += _lines[_index] + '\n';
    }
    _index = start;
    _fail("block \"<<" + terminator + "\" is not closed by a line \"" + terminator + "\"");
}

std::string ScenarioParser::_readTextFile(std::string const& path) const {
    if (path.empty()) {
        _fail("file name missing");
    }
    std::string const fullPath = path[0] == '/' ? path : _directoryOf(_fileName) + "/" + path;
    std::error_code ignored;
    std::ifstream in(fullPath, std::ios::binary);
    if (!in.is_open() || std::filesystem::is_directory(fullPath, ignored)) {
        _fail("cannot read file \"" + fullPath + "\"");
    }
    return _readAll(in);
}

std::string& ScenarioParser::_target(Stream stream) {
    if (stream == Stream::Stdout) {
        return _response.stdoutText;
    }
    if (stream == Stream::Stderr) {
        return _response.stderrText;
    }
    if (!_response.document) {
        _response.document = std::string();
    }
    return *_response.document;
}

void ScenarioParser::_fail(std::string const& problem) const {
    throw ScenarioError{_fileName, _index + 1, problem};
}

} // namespace PylonSim
