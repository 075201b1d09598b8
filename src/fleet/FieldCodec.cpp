#include "fleet/FieldCodec.h"

#include <cctype>
#include <limits>

namespace Fleet {

namespace {

void appendCounted(std::string& text, std::string const& field) {
    text += std::to_string(field.size());
    text += ':';
    text += field;
}

} // namespace

std::string FieldCodec::encode(Record const& record) {
    std::string text = std::to_string(record.size()) + ":";
    for (auto const& field : record) {
        appendCounted(text, field);
    }
    return text;
}

std::optional<std::vector<FieldCodec::Record>> FieldCodec::decode(std::string const& text) {
    std::vector<Record> records;
    std::size_t position = 0;
    while (position < text.size()) {
        std::size_t count = 0;
        if (!_readNumber(text, position, count) || count > text.size() - position) {
            return std::nullopt;
        }
        Record record;
        for (std::size_t i = 0; i < count; ++i) {
            std::size_t length = 0;
            if (!_readNumber(text, position, length) || length > text.size() - position) {
                return std::nullopt;
            }
            record.push_back(text.substr(position, length));
            position += length;
        }
        records.push_back(std::move(record));
    }
    return records;
}

bool FieldCodec::_readNumber(std::string const& text, std::size_t& position, std::size_t& number) {
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

} // namespace Fleet
