#include "history/ContentHash.h"

#include <array>
#include <cstdint>
#include <cstring>

namespace history {

namespace {

constexpr std::uint64_t gc_SeedA = 0x9E3779B97F4A7C15ULL;
constexpr std::uint64_t gc_SeedB = 0xC2B2AE3D27D4EB4FULL;
constexpr std::uint64_t gc_MultiplierA = 0x87C37B91114253D5ULL;
constexpr std::uint64_t gc_MultiplierB = 0x4CF5AD432745937FULL;

std::uint64_t rotateLeft(std::uint64_t value, int bits) {
    return (value << bits) | (value >> (64 - bits));
}

// The finaliser of SplitMix64: every input bit reaches every output bit.
std::uint64_t avalanche(std::uint64_t value) {
    value = (value ^ (value >> 30)) * 0xBF58476D1CE4E5B9ULL;
    value = (value ^ (value >> 27)) * 0x94D049BB133111EBULL;
    return value ^ (value >> 31);
}

// Two lanes with different constants take each 8-byte word, so the two
// halves of the result are independent.
struct Lanes {
    std::uint64_t a;
    std::uint64_t b;

    void take(std::uint64_t word) {
        a = rotateLeft(a ^ (word * gc_MultiplierA), 31) * gc_MultiplierB;
        b = rotateLeft(b ^ (word * gc_MultiplierB), 29) * gc_MultiplierA + a;
    }
};

void appendHex(std::string& text, std::uint64_t value) {
    constexpr char digits[] = "0123456789abcdef";
    for (int shift = 60; shift >= 0; shift -= 4) {
        text += digits[(value >> shift) & 0xF];
    }
}

} // namespace

std::string contentHash(std::string_view bytes) {
    Lanes lanes{gc_SeedA ^ bytes.size(), gc_SeedB + bytes.size()};
    std::size_t at = 0;
    for (; at + 8 <= bytes.size(); at += 8) {
        std::uint64_t word = 0;
        std::memcpy(&word, bytes.data() + at, 8);
        lanes.take(word);
    }
    std::uint64_t tail = 0;
    if (at < bytes.size()) {
        std::memcpy(&tail, bytes.data() + at, bytes.size() - at);
    }
    lanes.take(tail ^ (std::uint64_t{bytes.size() - at} << 56));
    std::string text;
    text.reserve(32);
    appendHex(text, avalanche(lanes.a ^ rotateLeft(lanes.b, 17)));
    appendHex(text, avalanche(lanes.b + lanes.a));
    return text;
}

} // namespace history
