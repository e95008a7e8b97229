// The words of the language by number: keywords of any version, soft keywords, and the operators whose token
// type alone doesn't distinguish them.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/scan.h"

namespace codeloom {

#define CODELOOM_WORDS(WORD)    \
    WORD(kFalse, "False")       \
    WORD(kNoneValue, "None")    \
    WORD(kTrue, "True")         \
    WORD(kAnd, "and")           \
    WORD(kAs, "as")             \
    WORD(kAssert, "assert")     \
    WORD(kAsync, "async")       \
    WORD(kAwait, "await")       \
    WORD(kBreak, "break")       \
    WORD(kClass, "class")       \
    WORD(kContinue, "continue") \
    WORD(kDef, "def")           \
    WORD(kDel, "del")           \
    WORD(kElif, "elif")         \
    WORD(kElse, "else")         \
    WORD(kExcept, "except")     \
    WORD(kExec, "exec")         \
    WORD(kFinally, "finally")   \
    WORD(kFor, "for")           \
    WORD(kFrom, "from")         \
    WORD(kGlobal, "global")     \
    WORD(kIf, "if")             \
    WORD(kImport, "import")     \
    WORD(kIn, "in")             \
    WORD(kIs, "is")             \
    WORD(kLambda, "lambda")     \
    WORD(kNonlocal, "nonlocal") \
    WORD(kNot, "not")           \
    WORD(kOr, "or")             \
    WORD(kPass, "pass")         \
    WORD(kPrint, "print")       \
    WORD(kRaise, "raise")       \
    WORD(kReturn, "return")     \
    WORD(kTry, "try")           \
    WORD(kWhile, "while")       \
    WORD(kWith, "with")         \
    WORD(kYield, "yield")       \
    WORD(kCase, "case")         \
    WORD(kLazy, "lazy")         \
    WORD(kMatch, "match")       \
    WORD(kType, "type")         \
    WORD(kUnderscore, "_")      \
    WORD(kArrow, "->")          \
    WORD(kMatrixAssign, "@=")   \
    WORD(kLessGreater, "<>")    \
    WORD(kNotEqual, "!=")

// kNone is any other name, and everything that isn't a name.
enum class EWord : uint8_t {
    kNone,
#define CODELOOM_WORD_ENUM(name, text) name,
    CODELOOM_WORDS(CODELOOM_WORD_ENUM)
#undef CODELOOM_WORD_ENUM
        kCount
};

// A name that no statement may bind, although the language has no such word: in sets of words it is the last
// bit.
inline constexpr std::string_view kDebugName = "__debug__";
inline constexpr uint64_t kDebugNameBit = uint64_t{1} << 63;
static_assert(static_cast<size_t>(EWord::kCount) < 64);

// A bit for each of the words.
template <class... Words>
constexpr uint64_t WordBits(Words... some_words) {
    return ((uint64_t{1} << static_cast<unsigned>(some_words)) | ...);
}

#define CODELOOM_WORD_TEXT(name, text) std::string_view(text),
inline constexpr std::array<std::string_view, static_cast<size_t>(EWord::kCount)> kWordTexts = {
    std::string_view(), CODELOOM_WORDS(CODELOOM_WORD_TEXT)};
#undef CODELOOM_WORD_TEXT

constexpr std::string_view TextOfWord(EWord word) {
    return kWordTexts[static_cast<size_t>(word)];
}

namespace words {

constexpr size_t kLongest = 8;
constexpr size_t kSlots = 256;

constexpr uint64_t KeyOf(std::string_view text) {
    uint64_t key = 0;
    for (size_t i = 0; i < text.size(); ++i)
        key |= static_cast<uint64_t>(static_cast<unsigned char>(text[i])) << (8 * i);
    return key;
}

struct CTable {
    uint64_t factor = 0x9E3779B97F4A7C15u;
    std::array<uint64_t, kSlots> keys{};
    std::array<EWord, kSlots> words{};

    constexpr size_t SlotOf(uint64_t key) const { return static_cast<size_t>(key * factor >> 56); }

    constexpr EWord Find(uint64_t key) const {
        const size_t slot = SlotOf(key);
        return keys[slot] == key ? words[slot] : EWord::kNone;
    }

    // Fills the table; false when two words fall into one slot.
    constexpr bool Fill() {
        keys = {};
        for (size_t word_i = 1; word_i < kWordTexts.size(); ++word_i) {
            const uint64_t key = KeyOf(kWordTexts[word_i]);
            const size_t slot = SlotOf(key);
            if (keys[slot] != 0) return false;
            keys[slot] = key;
            words[slot] = static_cast<EWord>(word_i);
        }
        return true;
    }
};

// Every word has at most eight bytes, and a slot of its own.
constexpr CTable MakeTable() {
    CTable table;
    while (!table.Fill()) table.factor *= 0xD1342543DE82EF95u;
    return table;
}

inline constexpr CTable kTable = MakeTable();

}  // namespace words

// The word that `text` is; kNone for any other text.
constexpr EWord WordOf(std::string_view text) {
    if (text.empty() || text.size() > words::kLongest) return EWord::kNone;
    return words::kTable.Find(words::KeyOf(text));
}

// The same for a part of a text, which isn't empty. Requires eight bytes from `pos` on.
inline EWord WordInside(std::string_view text, size_t pos, size_t length) {
    if (length > words::kLongest) return EWord::kNone;
    const uint64_t key = scan::Load(text, pos) & (~uint64_t{0} >> (64 - 8 * length));
    return words::kTable.Find(key);
}

// The same wherever it is.
inline EWord WordOfPart(std::string_view text, size_t pos, size_t length) {
    if (length > words::kLongest) return EWord::kNone;
    if (pos + scan::kStep > text.size()) return WordOf(text.substr(pos, length));
    return WordInside(text, pos, length);
}

static_assert(WordOf("while") == EWord::kWhile && WordOf("whale") == EWord::kNone);

}  // namespace codeloom
