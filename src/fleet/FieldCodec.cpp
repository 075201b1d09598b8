#include "fleet/FieldCodec.h"

#include <cctype>
#include <limits>

namespace fleet {

namespace {

void appendCounted(std::string& text, std::string const& field) {
    text += std::to_string(field.size());
    text += ':';
    text += field;
}

// Reads "<decimal>:" at position and moves past it.
bool readNumber(std::string const& text, std::size_t& position, std::size_t& number) {
    constexpr std::size_t limit = std::numeric_limits<std::size_t>::max() / 10 - 9;
    std::size_t value = 0;
    std::size_t digits = 0;
    while (position < text.size() && std::isdigit(static_cast<unsigned char>(text[position]))) {
        if (value > limit) {
            return false;
        }
        value = value * 10 + static_cast<std::size_t>(text[position] - '0');
        ++position;
        ++digits;
    }
    if (digits == 0 || position >= text.size() || text[position] != ':') {
        return false;
    }
    ++position;
    number = value;
    return true;
}

} // namespace

std::string encodeFields(FieldRecord const& record) {
    std::string text = std::to_string(record.size()) + ":";
    for (auto const& field : record) {
        appendCounted(text, field);
    }
    return text;
}

std::optional<std::vector<FieldRecord>> decodeFields(std::string const& text) {
    std::vector<FieldRecord> records;
    std::size_t position = 0;
    while (position < text.size()) {
        std::size_t count = 0;
        if (!readNumber(text, position, count) || count > text.size() - position) {
            return std::nullopt;
        }
        FieldRecord record;
        for (std::size_t i = 0; i < count; ++i) {
            std::size_t length = 0;
            if (!readNumber(text, position, length) || length > text.size() - position) {
                return std::nullopt;
            }
            record.push_back(text.substr(position, length));
            position += length;
        }
        records.push_back(std::move(record));
    }
    return records;
}

} // namespace fleet
