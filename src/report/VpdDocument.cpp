#include "report/VpdDocument.h"

#include "report/FailureReason.h"

namespace report {

namespace {

constexpr char gc_ValueStart[] = "<Value type=\"string\">";
constexpr char gc_ValueEnd[] = "</Value>";

// Where the value of the property named name starts, or npos.
std::string::size_type valueOf(std::string const& text, std::string const& name) {
    std::string const property = "name=\"" + name + "\">";
    std::string::size_type const at = text.find(property);
    if (at == std::string::npos) {
        return std::string::npos;
    }
    std::string::size_type const value = text.find(gc_ValueStart, at + property.size());
    if (value == std::string::npos) {
        return std::string::npos;
    }
    return value + std::string(gc_ValueStart).size();
}

std::optional<std::string> hostOf(std::string const& text) {
    std::string::size_type const start = valueOf(text, "HN");
    if (start == std::string::npos) {
        return std::nullopt;
    }
    std::string::size_type const end = text.find(gc_ValueEnd, start);
    if (end == std::string::npos) {
        return std::nullopt;
    }
    return text.substr(start, end - start);
}

// The reason is the last property the survey writes, and it may hold any
// text, "</Value>" included: it ends at the document's last "</Value>".
std::optional<std::string> reasonOf(std::string const& text) {
    std::string::size_type const start = valueOf(text, "VD");
    if (start == std::string::npos) {
        return std::nullopt;
    }
    std::string::size_type const end = text.rfind(gc_ValueEnd);
    if (end == std::string::npos || end < start) {
        return std::nullopt;
    }
    std::string reason = text.substr(start, end - start);
    if (!isFailureReason(reason)) {
        return std::nullopt;
    }
    return reason;
}

} // namespace

VpdDocument parseVpdDocument(std::string const& text) {
    return {hostOf(text), reasonOf(text)};
}

} // namespace report
