#include "text/character_names.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <iterator>

#include "text/character_name_bits.h"

namespace codeloom {

namespace {

char Upper(char c) {
    return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
}

bool IsUpperHexDigit(char c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'F');
}

// After these come the digits of the code point.
constexpr auto kNumberedNames = std::to_array<std::string_view>(
    {"CJK UNIFIED IDEOGRAPH-", "CJK COMPATIBILITY IDEOGRAPH-", "TANGUT IDEOGRAPH-", "NUSHU CHARACTER-",
     "KHITAN SMALL SCRIPT CHARACTER-", "EGYPTIAN HIEROGLYPH-", "JURCHEN CHARACTER-",
     "SMALL SEAL CHARACTER-"});

bool IsBeginning(std::string_view name, std::string_view upper) {
    return name.size() > upper.size() && std::equal(upper.begin(), upper.end(), name.begin(),
                                                    [](char one, char other) { return one == Upper(other); });
}

bool IsNumbered(std::string_view name, std::string_view beginning) {
    if (!IsBeginning(name, beginning)) return false;
    const std::string_view number = name.substr(beginning.size());
    return number.size() >= 4 && number.size() <= 5 &&
           std::all_of(number.begin(), number.end(), [](char c) { return IsUpperHexDigit(Upper(c)); });
}

// Its letters are those of the syllable.
bool IsSyllable(std::string_view name) {
    constexpr std::string_view kBeginning = "HANGUL SYLLABLE ";
    constexpr size_t kMostLetters = 7;
    if (!IsBeginning(name, kBeginning) || name.size() > kBeginning.size() + kMostLetters) return false;
    return std::all_of(name.begin() + kBeginning.size(), name.end(),
                       [](char c) { return Upper(c) >= 'A' && Upper(c) <= 'Z'; });
}

uint64_t HashOfUpper(std::string_view name) {
    uint64_t hash = 0xCBF29CE484222325u;
    for (const char c : name) hash = (hash ^ static_cast<unsigned char>(Upper(c))) * 0x100000001B3u;
    return hash;
}

bool IsInTable(std::string_view name) {
    constexpr uint64_t kBitCount = std::size(kNameBits) * 64;
    const uint64_t hash = HashOfUpper(name);
    const uint64_t first = hash & 0xFFFFFFFFu, step = hash >> 32 | 1;
    for (uint64_t probe_i = 0; probe_i < kNameProbeCount; ++probe_i) {
        const uint64_t bit = (first + probe_i * step) % kBitCount;
        if ((kNameBits[bit / 64] >> bit % 64 & 1) == 0) return false;
    }
    return true;
}

}  // namespace

bool MayBeCharacterName(std::string_view name) {
    return IsInTable(name) || IsSyllable(name) ||
           std::any_of(kNumberedNames.begin(), kNumberedNames.end(),
                       [&](std::string_view beginning) { return IsNumbered(name, beginning); });
}

}  // namespace codeloom
