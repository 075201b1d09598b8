#include "history/ColumnValue.h"

namespace history {

nlohmann::ordered_json jsonValue(SQLite::Column const& column) {
    if (column.isInteger()) {
        return column.getInt64();
    }
    if (column.isFloat()) {
        return column.getDouble();
    }
    if (column.isNull()) {
        return nullptr;
    }
    return column.getString();
}

std::string textValue(SQLite::Column const& column) {
    return column.isNull() ? std::string() : column.getString();
}

std::optional<long long> numberValue(SQLite::Column const& column) {
    return column.isNull() ? std::nullopt : std::optional<long long>(column.getInt64());
}

} // namespace history
