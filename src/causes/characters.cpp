// Characters that aren't Python, and what follows a backslash.

#include <algorithm>
#include <array>
#include <cstdint>

#include "causes/recognisers.h"

namespace codeloom {

namespace {

// A character that stands for another one, as word processors and other keyboards write it.
struct CLookalike {
    uint32_t character;
    std::string_view meant;
};

constexpr auto kLookalikes = std::to_array<CLookalike>({
    {0x00AB, "'\"'"},  {0x00BB, "'\"'"}, {0x00B4, "\"'\""}, {0x2018, "\"'\""}, {0x2019, "\"'\""},
    {0x201A, "\"'\""}, {0x201C, "'\"'"}, {0x201D, "'\"'"},  {0x201E, "'\"'"},  {0x00D7, "'*'"},
    {0x00F7, "'/'"},   {0x2010, "'-'"},  {0x2011, "'-'"},   {0x2012, "'-'"},   {0x2013, "'-'"},
    {0x2014, "'-'"},   {0x2212, "'-'"},  {0x2026, "'...'"}, {0x2044, "'/'"},   {0x2215, "'/'"},
    {0x2260, "'!='"},  {0x2264, "'<='"}, {0x2265, "'>='"},  {0x2192, "'->'"},  {0x2217, "'*'"},
    {0x3001, "','"},   {0x3002, "'.'"},  {0x300C, "'\"'"},  {0x300D, "'\"'"},  {0xFF08, "'('"},
    {0xFF09, "')'"},   {0xFF0C, "','"},  {0xFF1A, "':'"},   {0xFF1B, "';'"},   {0xFF1D, "'='"},
    {0xFF0B, "'+'"},   {0xFF0D, "'-'"},  {0xFF0E, "'.'"},   {0xFF02, "'\"'"},  {0xFF07, "\"'\""},
    {0x3010, "'['"},   {0x3011, "']'"},  {0xFF3B, "'['"},   {0xFF3D, "']'"},   {0xFF5B, "'{'"},
    {0xFF5D, "'}'"},   {0xFF1C, "'<'"},  {0xFF1E, "'>'"},   {0xFF01, "'!'"},   {0xFF1F, "'?'"},
});

struct CRange32 {
    uint32_t first;
    uint32_t last;
};

// Controls, blanks, marks without a shape, surrogates and private characters.
constexpr auto kNonPrintable = std::to_array<CRange32>({
    {0x0000, 0x001F}, {0x007F, 0x00A0}, {0x00AD, 0x00AD},   {0x0600, 0x0605},   {0x061C, 0x061C},
    {0x06DD, 0x06DD}, {0x070F, 0x070F}, {0x1680, 0x1680},   {0x180E, 0x180E},   {0x2000, 0x200F},
    {0x2028, 0x202F}, {0x205F, 0x206F}, {0x3000, 0x3000},   {0xD800, 0xF8FF},   {0xFEFF, 0xFEFF},
    {0xFFF0, 0xFFFB}, {0xFFFE, 0xFFFF}, {0x1D173, 0x1D17A}, {0xE0000, 0xE00FF}, {0xF0000, 0x10FFFF},
});

uint32_t CharacterOf(std::string_view utf8) {
    const auto byte = [&](size_t i) { return static_cast<uint32_t>(static_cast<unsigned char>(utf8[i])); };
    if (utf8.size() == 1) return byte(0);
    uint32_t character = byte(0) & (0x7Fu >> utf8.size());
    for (size_t i = 1; i < utf8.size(); ++i) character = character << 6 | (byte(i) & 0x3F);
    return character;
}

// U+00A0
std::string NumberOf(uint32_t character) {
    constexpr std::string_view kDigits = "0123456789ABCDEF";
    std::string number;
    for (; character != 0 || number.size() < 4; character /= 16) number.insert(0, 1, kDigits[character % 16]);
    return "U+" + number;
}

bool IsNonPrintable(uint32_t character) {
    return std::any_of(kNonPrintable.begin(), kNonPrintable.end(), [&](const CRange32& range) {
        return range.first <= character && character <= range.last;
    });
}

std::string HintFor(uint32_t character) {
    const auto meant = std::find_if(kLookalikes.begin(), kLookalikes.end(),
                                    [&](const CLookalike& one) { return one.character == character; });
    return meant == kLookalikes.end() ? std::string() : Joined("write ", meant->meant, " instead");
}

}  // namespace

CCause AfterBackslash(const CFaultyLine& line, int i) {
    const bool is_error = line.Is(i, kTokenId_ERRORTOKEN) || line.Is(i, kTokenId_BACKSLASH);
    if (!is_error || !line.Text(i).starts_with('\\')) return {};
    return line.Problem(ECode::kAfterBackslash, i, i,
                        "unexpected character after line continuation character",
                        "a backslash continues a row only as its last character");
}

CCause InvalidCharacter(const CFaultyLine& line, int i) {
    if (!line.Is(i, kTokenId_ERRORTOKEN)) return {};
    const uint32_t character = CharacterOf(line.Text(i));
    const std::string number = NumberOf(character);
    if (IsNonPrintable(character))
        return line.Problem(ECode::kInvalidCharacter, i, i,
                            Joined("invalid non-printable character ", number),
                            "remove it, or write a blank instead");
    if (character < 0x80)
        return line.Problem(ECode::kInvalidCharacter, i, i,
                            Joined("'", line.Text(i), "' has no meaning in Python"));
    return line.Problem(ECode::kInvalidCharacter, i, i,
                        Joined("invalid character '", line.Text(i), "' (", number, ")"), HintFor(character));
}

}  // namespace codeloom
