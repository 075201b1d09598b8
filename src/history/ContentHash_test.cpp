#include "history/ContentHash.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace {

using history::contentHash;

TEST(HistoryContentHash, IsThirtyTwoLowerCaseHexDigits) {
    std::string const hash = contentHash("<com.zor.inventory/>");
    EXPECT_EQ(32u, hash.size());
    EXPECT_EQ(std::string::npos, hash.find_first_not_of("0123456789abcdef"));
}

TEST(HistoryContentHash, SameBytesGiveTheSameHash) {
    EXPECT_EQ(contentHash("a document"), contentHash(std::string("a document")));
}

TEST(HistoryContentHash, EveryOneByteChangeAndEveryLengthGivesAnotherHash) {
    std::set<std::string> hashes;
    std::string text(40, 'x');
    for (std::size_t length = 0; length <= text.size(); ++length) {
        hashes.insert(contentHash(text.substr(0, length)));
    }
    for (std::size_t at = 0; at < text.size(); ++at) {
        std::string changed = text;
        changed[at] = 'y';
        hashes.insert(contentHash(changed));
    }
    EXPECT_EQ(41u + 40u, hashes.size());
}

TEST(HistoryContentHash, TrailingNulBytesCount) {
    EXPECT_NE(contentHash("ab"), contentHash(std::string("ab\0", 3)));
}

} // namespace
