#include "RemoteActionRequest.h"

namespace PylonSim {

namespace {

constexpr char gc_ActionPrefix[] = "ZOR.ServiceEvent::::";
constexpr char gc_Separator[] = "::";

std::string _joined(std::vector<std::string> const& arguments) {
    std::string text;
    for (std::string const& argument : arguments) {
        text += (text.empty() ? "" : " ") + argument;
    }
    return text;
}

std::string _valueAt(std::string const& text, std::size_t start) {
    return text.substr(start, text.find(gc_Separator, start) - start);
}

} // namespace

RemoteActionRequest::RemoteActionRequest(std::vector<std::string> const& arguments)
    : _text(_joined(arguments)) {
    std::size_t const prefix = _text.find(gc_ActionPrefix);
    if (prefix != std::string::npos) {
        _action = _valueAt(_text, prefix + sizeof gc_ActionPrefix - 1);
    }
    _findPartition();
    _hasLocalFN = _find("LocalFN", _localFN);
}

std::string const& RemoteActionRequest::get_Action() const {
    return _action;
}

std::string const& RemoteActionRequest::get_PartitionID() const {
    return _partitionID;
}

bool RemoteActionRequest::has_LocalFN() const {
    return _hasLocalFN;
}

std::string const& RemoteActionRequest::get_LocalFN() const {
    return _localFN;
}

bool RemoteActionRequest::_find(std::string const& key, std::string& value) const {
    std::string const marker = gc_Separator + key + gc_Separator;
    std::size_t const position = _text.find(marker);
    if (position == std::string::npos) {
        return false;
    }
    value = _valueAt(_text, position + marker.size());
    return true;
}

void RemoteActionRequest::_findPartition() {
    std::string value;
    if (_find("PartitionId", value)) {
        _partitionID = value;
        return;
    }
    if (!_find("PartitionArray", value)) {
        return;
    }
    if (!value.empty() && value.front() == '{') {
        value.erase(0, 1);
    }
    if (!value.empty() && value.back() == '}') {
        value.pop_back();
    }
    _partitionID = value;
}

} // namespace PylonSim
