#pragma once

#include <SQLiteCpp/Column.h>
#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace history {

// A value the history's queries read, as the command's outputs give it.

// Integer, real, text or null, as SQLite holds it.
nlohmann::ordered_json jsonValue(SQLite::Column const& column);

// Its text as SQLite gives it; empty for null.
std::string textValue(SQLite::Column const& column);

// nullopt for null.
std::optional<long long> numberValue(SQLite::Column const& column);

} // namespace history
