#pragma once

#include <optional>
#include <string>
#include <vector>

namespace Fleet {

// Carries records of text fields between the run's processes through a pipe,
// every byte kept: each field is its decimal length, ":", then its bytes.
// A record is its field count in the same form followed by its fields.
class FieldCodec {
public:
    using Record = std::vector<std::string>;

    static std::string encode(Record const& record);
    // Every record of a text made of whole encoded records; nullopt when the
    // text is cut short or malformed.
    static std::optional<std::vector<Record>> decode(std::string const& text);

private:
    static bool _readNumber(std::string const& text, std::size_t& position, std::size_t& number);
};

} // namespace Fleet
