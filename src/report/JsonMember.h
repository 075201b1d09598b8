#pragma once

#include <nlohmann/json.hpp>

namespace report {

// The member name of object, or a null value when object is not an object or
// lacks it: the report reads summaries written by other programs and must
// take a missing field as unknown, never fail on it.
nlohmann::ordered_json const& member(nlohmann::ordered_json const& object, char const* name);

} // namespace report
