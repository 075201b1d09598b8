#pragma once

#include <optional>
#include <string>

namespace report {

// The little a report needs from a VPD document: the partition's host name
// and, for a default document the survey wrote for a failed partition, the
// reason. Documents are read as text, not as XML: the survey writes console
// texts into them unescaped, so a host name holding "<" or "&" would make an
// XML parser give up on exactly the documents an operator needs to see.
struct VpdDocument {
    // The value of the HostName (HN) property, when the document has one.
    std::optional<std::string> host;
    // The value of the reason (VD) property, when it reads as a reason the
    // survey writes.
    std::optional<std::string> reason;
};

VpdDocument parseVpdDocument(std::string const& text);

} // namespace report
