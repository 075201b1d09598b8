// splitString with an arbitrary text and an arbitrary delimiter.
// Input: the delimiter as a FuzzedDataProvider string, then the text.

#include "Fuzz_Utility.h"

#include "utility/StringUtility.h"

#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace {

// What a caller had in its vector before the call.
std::vector<std::string> const gc_EarlierPieces = {"earlier", ""};

std::string u_join(std::vector<std::string> const& pieces, std::string const& delimiter) {
    std::string text;
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        text += (i == 0 ? "" : delimiter) + pieces[i];
    }
    return text;
}

void u_check_Pieces(std::string const& text, std::string const& delimiter, int count,
                    std::vector<std::string> const& pieces) {
    Fuzz_Utility::u_require(count >= 1 && static_cast<std::size_t>(count) == pieces.size(),
                            "the count is the number of pieces, at least one", text);
    for (std::string const& piece : pieces) {
        Fuzz_Utility::u_require(piece.find(delimiter) == std::string::npos,
                                "no piece holds the delimiter", piece);
    }
    std::string const joined = u_join(pieces, delimiter);
    Fuzz_Utility::u_require(joined == text || joined + delimiter == text,
                            "joining the pieces gives the text less at most one trailing delimiter",
                            text);
    Fuzz_Utility::u_require(pieces == Fuzz_Utility::u_expected_Pieces(text, delimiter),
                            "the pieces are the texts between the delimiters, left to right", text);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    FuzzedDataProvider provider(data, size);
    std::string const delimiter = provider.ConsumeRandomLengthString();
    std::string const text = provider.ConsumeRemainingBytesAsString();
    std::vector<std::string> pieces = gc_EarlierPieces;
    int const count = StringUtility::splitString(text, delimiter, pieces);
    if (text.empty() || delimiter.empty()) {
        Fuzz_Utility::u_require(count == 0 && pieces == gc_EarlierPieces,
                                "an empty text or delimiter gives 0 and leaves the pieces", text);
        return 0;
    }
    u_check_Pieces(text, delimiter, count, pieces);
    return 0;
}
