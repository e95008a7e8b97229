// Hashes of texts that are short for the most part, and their comparison.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace codeloom {

// Another one in each process, so that nobody can make texts that all have one hash.
extern const uint64_t gTextHashSeed;

namespace text_hash {

template <class Word>
Word Load(const char* pointer) {
    Word word;
    std::memcpy(&word, pointer, sizeof word);
    return word;
}

// The first and the last eight bytes of a text, which overlap in a short one; of less than eight what tells
// texts of one length apart.
struct CEnds {
    uint64_t first = 0;
    uint64_t last = 0;
};

inline CEnds EndsOf(const char* text, size_t length) {
    const auto byte_at = [text](size_t i) { return uint64_t{static_cast<unsigned char>(text[i])}; };
    if (length >= 8) return {Load<uint64_t>(text), Load<uint64_t>(text + length - 8)};
    if (length >= 4) return {Load<uint32_t>(text), Load<uint32_t>(text + length - 4)};
    if (length == 0) return {};
    return {byte_at(0) | byte_at(length / 2) << 8, byte_at(length - 1)};
}

inline uint64_t Mixed(uint64_t hash, uint64_t word) {
    hash = (hash ^ word) * 0x9E3779B97F4A7C15ULL;
    return hash ^ hash >> 32;
}

}  // namespace text_hash

inline uint32_t HashOf(std::string_view text) {
    using namespace text_hash;
    const CEnds ends = EndsOf(text.data(), text.size());
    uint64_t hash = Mixed(Mixed(gTextHashSeed + text.size(), ends.first), ends.last);
    for (size_t pos = 8; pos + 8 < text.size(); pos += 8)
        hash = Mixed(hash, Load<uint64_t>(text.data() + pos));
    return static_cast<uint32_t>(hash);
}

// Of two texts of one length.
inline bool AreEqual(const char* a, const char* b, size_t length) {
    using namespace text_hash;
    const CEnds a_ends = EndsOf(a, length), b_ends = EndsOf(b, length);
    if (a_ends.first != b_ends.first || a_ends.last != b_ends.last) return false;
    for (size_t pos = 8; pos + 8 < length; pos += 8)
        if (Load<uint64_t>(a + pos) != Load<uint64_t>(b + pos)) return false;
    return true;
}

}  // namespace codeloom
