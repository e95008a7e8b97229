// Hashes of texts that are short for the most part.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace codeloom {

// Different in each process, so that nobody can make texts that all have one hash.
extern const uint64_t gTextHashSeed;

namespace text_hash {

template <class Word>
Word Load(const char* pointer) {
    Word word;
    std::memcpy(&word, pointer, sizeof word);
    return word;
}

// The first and the last eight bytes of a text, which overlap in a short one; of less than eight what sets
// texts of one length apart.
struct CEnds {
    uint64_t first = 0;
    uint64_t last = 0;

    bool operator==(const CEnds&) const = default;
};

inline CEnds EndsOf(const char* text, size_t length) {
    const auto byte_at = [text](size_t i) { return uint64_t{static_cast<unsigned char>(text[i])}; };
    if (length >= 8) return {Load<uint64_t>(text), Load<uint64_t>(text + length - 8)};
    if (length >= 4) return {Load<uint32_t>(text), Load<uint32_t>(text + length - 4)};
    if (length == 0) return {};
    return {byte_at(0) | byte_at(length / 2) << 8, byte_at(length - 1)};
}

// Both halves of a product, which depend on each bit of both factors.
inline uint64_t Mixed(uint64_t a, uint64_t b) {
    __extension__ using CProduct = unsigned __int128;
    const CProduct product = static_cast<CProduct>(a) * b;
    return static_cast<uint64_t>(product) ^ static_cast<uint64_t>(product >> 64);
}

}  // namespace text_hash

// The ends distinguish texts of this length.
inline constexpr size_t kMostInEnds = 16;

// Of a text of at most so many bytes, whose ends are known.
inline uint32_t HashOf(text_hash::CEnds ends, size_t length) {
    constexpr uint64_t kOther = 0x9E3779B97F4A7C15ULL;
    const uint64_t hash = text_hash::Mixed(ends.first ^ gTextHashSeed, ends.last ^ (kOther + length));
    return static_cast<uint32_t>(hash);
}

// The same of a text of any length.
inline uint32_t HashOf(text_hash::CEnds ends, std::string_view text) {
    uint64_t hash = HashOf(ends, text.size());
    if (text.size() <= kMostInEnds) return static_cast<uint32_t>(hash);
    for (size_t pos = 8; pos + 8 < text.size(); pos += 8)
        hash = text_hash::Mixed(hash ^ gTextHashSeed, text_hash::Load<uint64_t>(text.data() + pos));
    return static_cast<uint32_t>(hash);
}

}  // namespace codeloom
