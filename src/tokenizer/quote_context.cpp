#include "tokenizer/quote_context.h"

#include <algorithm>
#include <array>

#include "tokenizer/keywords.h"
#include "tokenizer/operands.h"
#include "tokenizer/rows.h"

namespace codeloom {

namespace {

constexpr auto kBeforeString =
    std::to_array<EWord>({EWord::kReturn, EWord::kYield, EWord::kPrint, EWord::kAssert, EWord::kRaise,
                          EWord::kIn, EWord::kAnd, EWord::kOr, EWord::kNot, EWord::kElse, EWord::kExec});

// The text up to `end`, which ends in ":", ends with the last row of a header.
bool EndsLikeHeader(std::string_view text, size_t end) {
    if (end > 1 && text[end - 2] == ')') return true;
    const size_t start = SkipBlanks(text, RowStart(text, end - 1));
    return IsCompoundWord(WordAt(text, start)) || ByteKind(text[start]) == EByteKind::kCloser;
}

// The end of the last row with code before `end`, blanks left out.
size_t SkipBack(std::string_view text, size_t end) {
    for (;;) {
        while (end > 0 && (IsBlank(text[end - 1]) || IsRowEnd(text[end - 1]))) --end;
        const size_t row = RowStart(text, end);
        if (ByteAt(text, SkipBlanks(text, row)) != '#' || row == 0) return end;
        end = row;
    }
}

// The place before the prefix of the quotes at `pos`, if they have one.
size_t SkipPrefixBack(std::string_view text, size_t pos) {
    for (size_t length = 2; length > 0; --length) {
        if (pos < length || (pos > length && IsNameByte(text[pos - length - 1]))) continue;
        const CStringStart start = ReadStringStart(text, pos - length);
        if (start.quote_length && start.prefix_length == length) return pos - length;
    }
    return pos;
}

bool IsBeforeString(EWord word) {
    return std::find(kBeforeString.begin(), kBeforeString.end(), word) != kBeforeString.end();
}

}  // namespace

bool EndsBeforeString(std::string_view text) {
    const size_t end = SkipPrefixBack(text, text.size() - 1);
    const size_t last = SkipBack(text, end);
    if (last == 0) return false;
    const char c = text[last - 1];
    const bool is_on_row = FindRowEnd(text.substr(0, end), last) == end;
    if (c == ':') return is_on_row || EndsLikeHeader(text, last);
    if (std::string_view("([{,+%|&\\").find(c) != std::string_view::npos) return true;
    size_t word = last;
    while (word > 0 && IsNameByte(text[word - 1])) --word;
    return is_on_row && (c == '=' || IsBeforeString(WordOf(text.substr(word, last - word))));
}

bool CannotFollowString(std::string_view text, size_t pos) {
    if (pos >= text.size()) return false;
    return StartsStatement(text, pos) || (BeginsOperand(text, pos) && !BeginsString(text, pos));
}

bool HardlyFollowsString(std::string_view text, size_t pos, size_t end) {
    switch (const char next = ByteAt(text, pos + 1); ByteAt(text, pos)) {
        case '.':
        case ':':
            return ByteKind(next) == (text[pos] == ':' ? EByteKind::kNameStart : EByteKind::kDot);
        case '=':
        case '!':
            return next != '=';
        case '"':
        case '\'':
            return pos == end;
        case '\\':
            return !IsRowEnd(next);
        default:
            if (IsNameByte(ByteAt(text, pos))) return pos == end;
            return std::string_view("*-/<>&|^~@$?`([{").find(ByteAt(text, pos)) != std::string_view::npos;
    }
}

bool HardlyBeginsCode(std::string_view text, size_t pos) {
    if (pos >= text.size()) return false;
    if (ContinuesExpression(text, pos)) return true;
    const std::string_view word = WordTextAt(text, pos);
    const EWord number = WordOf(word);
    if (word.empty() || !IsOperandWord(number) || IsSoftKeyword(number)) return false;
    const size_t next = SkipBlanks(text, pos + word.size());
    if (next == pos + word.size() || next == text.size()) return false;
    return ByteKind(text[next]) == EByteKind::kNameStart || BeginsOperand(text, next);
}

size_t SkipToNextRow(std::string_view text, size_t pos) {
    CPlace place = PlaceWithinRow(pos);
    do {
        if (ByteAt(text, place.pos) == '#') place.pos = FindRowEnd(text, place.pos);
        if (!SkipRowEnd(text, place)) return text.size();
        SkipBlankRows(text, place);
    } while (ByteAt(text, place.pos) == '#');
    return place.pos;
}

bool StandsInBrackets(std::string_view text, size_t pos) {
    const size_t last = SkipBack(text, pos);
    return last > 0 && ByteKind(text[last - 1]) == EByteKind::kOpener;
}

bool StandsOutsideBrackets(std::string_view text, size_t pos) {
    const size_t row = RowStart(text, pos);
    if (text.substr(row, pos - row).find_first_of("([{)]}'\"#") != std::string_view::npos) return false;
    if (ContinuesExpression(text, SkipBlanks(text, row))) return false;
    const size_t last = SkipBack(text, row);
    return last == 0 ||
           std::string_view("([{,=+-*/%|&<>\\\"'").find(text[last - 1]) == std::string_view::npos;
}

}  // namespace codeloom
