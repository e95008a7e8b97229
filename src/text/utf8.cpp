#include "text/utf8.h"

#include <cstdint>

#include "text/scan.h"

namespace codeloom {

namespace {

struct CSequence {
    size_t length;  // 0 where none begins with this byte
    uint8_t least_second;
    uint8_t most_second;
};

CSequence SequenceOf(uint8_t first) {
    if (first < 0x80) return {1, 0, 0};
    if (first < 0xC2) return {0, 0, 0};
    if (first < 0xE0) return {2, 0x80, 0xBF};
    if (first < 0xF0) {
        const uint8_t least = first == 0xE0 ? 0xA0 : 0x80;
        const uint8_t most = first == 0xED ? 0x9F : 0xBF;
        return {3, least, most};
    }
    if (first > 0xF4) return {0, 0, 0};
    const uint8_t least = first == 0xF0 ? 0x90 : 0x80;
    const uint8_t most = first == 0xF4 ? 0x8F : 0xBF;
    return {4, least, most};
}

// The length of the character at `pos`; 0 for none.
size_t CharacterLength(std::string_view bytes, size_t pos) {
    const auto at = [&](size_t i) { return static_cast<uint8_t>(bytes[pos + i]); };
    const CSequence sequence = SequenceOf(at(0));
    if (sequence.length < 2) return sequence.length;
    if (pos + sequence.length > bytes.size()) return 0;
    if (at(1) < sequence.least_second || at(1) > sequence.most_second) return 0;
    for (size_t i = 2; i < sequence.length; ++i)
        if ((at(i) & 0xC0) != 0x80) return 0;
    return sequence.length;
}

}  // namespace

bool IsUtf8(std::string_view bytes) {
    size_t pos = 0;
    while (pos < bytes.size()) {
        if (pos + scan::kStep <= bytes.size() && (scan::Load(bytes, pos) & scan::kHighBits) == 0) {
            pos += scan::kStep;
            continue;
        }
        const size_t length = CharacterLength(bytes, pos);
        if (length == 0) return false;
        pos += length;
    }
    return true;
}

}  // namespace codeloom
