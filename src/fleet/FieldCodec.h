#pragma once

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// Carries records of text fields between the run's processes through a pipe,
// every byte kept: each field is its decimal length, ":", then its bytes.
// A record is its field count in the same form followed by its fields.
using FieldRecord = std::vector<std::string>;

std::string encodeFields(FieldRecord const& record);
// Every record of a text made of whole encoded records; nullopt when the
// text is cut short or malformed.
std::optional<std::vector<FieldRecord>> decodeFields(std::string const& text);

} // namespace fleet
