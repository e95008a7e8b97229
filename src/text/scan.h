// Runs of bytes: how far blanks, names, strings and rows go. They are most of a text, so they are read
// eight bytes at a time where that is less work.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

#include "text/char_class.h"

namespace codeloom {

namespace scan {

inline constexpr size_t kStep = 8;
inline constexpr uint64_t kEachByte = 0x0101010101010101u;
inline constexpr uint64_t kHighBits = kEachByte << 7;

// The bytes from `pos` on, the first one lowest. Requires eight bytes there.
inline uint64_t Load(std::string_view text, size_t pos) {
    uint64_t bytes;
    std::memcpy(&bytes, text.data() + pos, kStep);
    if constexpr (std::endian::native == std::endian::big) bytes = __builtin_bswap64(bytes);
    return bytes;
}

// The index of the lowest byte that isn't zero. Requires one.
inline size_t FirstByte(uint64_t bytes) {
    return static_cast<size_t>(std::countr_zero(bytes)) / 8;
}

#ifdef __SSE2__
inline constexpr size_t kWideStep = 16;

// A bit for each of sixteen bytes that may be in an ASCII name.
inline unsigned NameBytes(const char* bytes) {
    const auto is_within = [](__m128i values, char first, char last) {
        const __m128i from_first = _mm_sub_epi8(values, _mm_set1_epi8(first));
        return _mm_cmpeq_epi8(_mm_min_epu8(from_first, _mm_set1_epi8(static_cast<char>(last - first))),
                              from_first);
    };
    const __m128i values = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes));
    const __m128i are_letters = is_within(_mm_or_si128(values, _mm_set1_epi8(0x20)), 'a', 'z');
    const __m128i are_digits = is_within(values, '0', '9');
    const __m128i are_underscores = _mm_cmpeq_epi8(values, _mm_set1_epi8('_'));
    const __m128i are_all = _mm_or_si128(_mm_or_si128(are_letters, are_digits), are_underscores);
    return static_cast<unsigned>(_mm_movemask_epi8(are_all));
}
#endif

}  // namespace scan

// The first position from `pos` on whose byte has the trait, or doesn't have it.
template <EByteTrait trait, bool has>
inline size_t FindByte(std::string_view text, size_t pos) {
    for (; pos + scan::kStep <= text.size(); pos += scan::kStep) {
        for (size_t i = 0; i < scan::kStep; ++i) {
            if (HasTrait(text[pos + i], trait) == has) return pos + i;
        }
    }
    while (pos < text.size() && HasTrait(text[pos], trait) != has) ++pos;
    return pos;
}

// The end of the ASCII name at `pos`.
inline size_t SkipNameBytes(std::string_view text, size_t pos) {
#ifdef __SSE2__
    for (; pos + scan::kWideStep <= text.size(); pos += scan::kWideStep) {
        const unsigned others = ~scan::NameBytes(text.data() + pos) & 0xFFFFu;
        if (others != 0) return pos + static_cast<size_t>(std::countr_zero(others));
    }
#endif
    return FindByte<kContinuesName, false>(text, pos);
}

// The length of a name at `pos`, as far as it is ASCII, when it and the byte after it lie within the next
// sixteen bytes, and these within the text; zero for all others.
inline size_t ShortNameLength([[maybe_unused]] std::string_view text, [[maybe_unused]] size_t pos) {
#ifdef __SSE2__
    if (pos + scan::kWideStep <= text.size()) {
        const unsigned others = ~scan::NameBytes(text.data() + pos) & 0xFFFFu;
        if (others != 0) return static_cast<size_t>(std::countr_zero(others));
    }
#endif
    return 0;
}

// The first position from `pos` on that isn't a space.
inline size_t SkipSpaces(std::string_view text, size_t pos) {
    constexpr uint64_t kSpaces = ' ' * scan::kEachByte;
    for (; pos + scan::kStep <= text.size(); pos += scan::kStep) {
        const uint64_t others = scan::Load(text, pos) ^ kSpaces;
        if (others != 0) return pos + scan::FirstByte(others);
    }
    while (pos < text.size() && text[pos] == ' ') ++pos;
    return pos;
}

namespace scan {

// Row ends are among the lowest bytes, which are rare in text. Not zero when one of the eight is that low;
// only the lowest bit that is set is sure to be one.
inline uint64_t LowBytes(uint64_t bytes) {
    constexpr uint64_t kAfterRowEnds = ('\r' + 1) * kEachByte;
    return (bytes - kAfterRowEnds) & ~bytes & kHighBits;
}

}  // namespace scan

// The start of the row that holds `pos`.
inline size_t RowStart(std::string_view text, size_t pos) {
    while (pos >= scan::kStep && scan::LowBytes(scan::Load(text, pos - scan::kStep)) == 0) pos -= scan::kStep;
    while (pos > 0 && !IsRowEnd(text[pos - 1])) --pos;
    return pos;
}

// The end of the row that holds `pos`, its row end left out.
inline size_t FindRowEnd(std::string_view text, size_t pos) {
    while (pos + scan::kStep <= text.size()) {
        const uint64_t low = scan::LowBytes(scan::Load(text, pos));
        if (low == 0) {
            pos += scan::kStep;
            continue;
        }
        pos += scan::FirstByte(low);
        if (IsRowEnd(text[pos])) return pos;
        ++pos;
    }
    while (pos < text.size() && !IsRowEnd(text[pos])) ++pos;
    return pos;
}

}  // namespace codeloom
