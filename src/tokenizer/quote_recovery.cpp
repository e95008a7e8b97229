#include "tokenizer/quote_recovery.h"

#include <algorithm>
#include <array>

#include "tokenizer/keywords.h"
#include "tokenizer/operands.h"
#include "tokenizer/prose_end.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

namespace {

// That the text ends within a string is worth as much as so many broken rows.
constexpr int kOpenEndWeight = 3;

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

// The text before the quote that it ends with is like code that a string follows: ends in a sign, a header or
// a keyword.
bool EndsBeforeString(std::string_view text) {
    const size_t end = SkipPrefixBack(text, text.size() - 1);
    const size_t last = SkipBack(text, end);
    if (last == 0) return false;
    const char c = text[last - 1];
    if (c == ':') return EndsLikeHeader(text, last);
    if (std::string_view("=([{,+%|&").find(c) != std::string_view::npos) return true;
    size_t word = last;
    while (word > 0 && IsNameByte(text[word - 1])) --word;
    const bool is_on_row = RowStart(text, last) == RowStart(text, end);
    return is_on_row && IsBeforeString(WordOf(text.substr(word, last - word)));
}

// What begins at `pos` can't follow a string on its row.
bool BeginsAfterString(std::string_view text, size_t pos) {
    if (pos >= text.size()) return false;
    return StartsStatement(text, pos) || (BeginsOperand(text, pos) && !BeginsString(text, pos));
}

// What begins at `pos` hardly follows a string on its row.
bool HardlyFollowsString(std::string_view text, size_t pos) {
    switch (const char next = ByteAt(text, pos + 1); ByteAt(text, pos)) {
        case '.':
        case ':':
            return ByteKind(next) == (text[pos] == ':' ? EByteKind::kNameStart : EByteKind::kDot);
        case '=':
        case '!':
            return next != '=';
        default:
            return std::string_view("*-/<>&|^~@$?`([{").find(ByteAt(text, pos)) != std::string_view::npos;
    }
}

// The row at `pos` begins with two words that don't stand side by side in code, or with what needs an operand
// before it.
bool HardlyBeginsCode(std::string_view text, size_t pos) {
    if (pos >= text.size()) return false;
    if (ContinuesExpression(text, pos)) return true;
    const std::string_view word = WordTextAt(text, pos);
    const EWord number = WordOf(word);
    if (word.empty() || !IsOperandWord(number) || IsSoftKeyword(number)) return false;
    const size_t next = SkipBlanks(text, pos + word.size());
    return next > pos + word.size() && next < text.size() && BeginsOperand(text, next);
}

// The code of the row after the one that ends at `pos`; nothing when that isn't its end.
size_t SkipToNextRow(std::string_view text, size_t pos) {
    CPlace place = PlaceWithinRow(pos);
    if (!SkipRowEnd(text, place)) return text.size();
    SkipBlankRows(text, place);
    return place.pos;
}

bool StandsInBrackets(std::string_view text, size_t pos) {
    const size_t last = SkipBack(text, pos);
    return last > 0 && ByteKind(text[last - 1]) == EByteKind::kOpener;
}

// The string at `pos` stands in no brackets, as far as its row and the end of the row before show.
bool StandsOutsideBrackets(std::string_view text, size_t pos) {
    const size_t row = RowStart(text, pos);
    if (text.substr(row, pos - row).find_first_of("([{)]}'\"#") != std::string_view::npos) return false;
    const size_t last = SkipBack(text, row);
    return last == 0 ||
           std::string_view("([{,=+-*/%|&<>\\\"'").find(text[last - 1]) == std::string_view::npos;
}

// One of two ways to read the rows after a string, and how badly they fit.
class CReading {
  public:
    // Begins after the string from `pos` up to `end`.
    CReading(CLexer& lexer, size_t pos, size_t end)
        : _fReader(lexer, PlaceWithinRow(end)),
          _fPos(end),
          _fInBrackets(StandsInBrackets(lexer.Text(), pos)),
          _fKnowsBrackets(StandsOutsideBrackets(lexer.Text(), pos)),
          _fIndent(RowIndent(lexer.Text(), pos)) {}

    int RowCount() const { return _fRowCount; }
    int BrokenCount() const { return _fBrokenCount; }
    bool HasReadTriple() const { return _fHasReadTriple; }
    bool IsAtEnd() const { return _fIsAtEnd; }
    size_t Pos() const { return _fPos; }
    void NoteBroken(int count) { _fBrokenCount += count; }

    void ReadRow() {
        _fIsAtEnd = !_fReader.Next(_fRow);
        if (_fIsAtEnd) return;
        ++_fRowCount;
        _fPos = _fRow.end;
        if (IsComment(_fRow)) return;
        const bool is_out_of_place = _IsOutOfPlace();
        NoteBroken(is_out_of_place || IsBroken(_fRow));
        if (is_out_of_place) _Reset();
        if (EndsInOpenTriple(_fRow)) NoteBroken(kOpenEndWeight);
        _fHasReadTriple |= HasTripleQuotes(_fRow);
        _fInBrackets &= _fRow.stray_closer_end == 0;
        _NoteIndent();
    }

  private:
    // The row is one of code, but not here: a statement within brackets, what is none outside of them, or a
    // row that is deeper than its block.
    bool _IsOutOfPlace() const {
        if (_fInBrackets || _fRow.is_in_brackets) return BeginsStatement(_fRow) || BeginsHeader(_fRow);
        if (!_fKnowsBrackets || !_fRow.IsWhole()) return false;
        return _fRow.indent > _fIndent || LooksLikeProse(_fRow);
    }

    // What was open before the row counts no more, so that each fault counts once.
    void _Reset() {
        _fInBrackets = false;
        if (_fRow.is_in_brackets) _fReader.ForgetBrackets();
        _fRow.is_in_brackets = false;
    }

    // The next row may be as deep as a statement's first row, and any depth after a header.
    void _NoteIndent() {
        if (_fInBrackets || _fRow.stray_closer_end) {
            _fKnowsBrackets = false;
        } else if (!_fRow.is_in_brackets && _fRow.IsWhole()) {
            _fIndent = _fRow.indent;
            _fKnowsBrackets |= BeginsStatement(_fRow);
        }
        if (_fReader.OpenBrackets().empty() && EndsInColon(_fRow)) _fIndent = INT32_MAX;
    }

    CRowReader _fReader;
    CTokenRow _fRow;
    size_t _fPos;
    bool _fInBrackets;     // that were opened before
    bool _fKnowsBrackets;  // no others than those that the rows open
    int32_t _fIndent;      // how deep the next statement may be
    int _fRowCount = 0;
    int _fBrokenCount = 0;
    bool _fHasReadTriple = false;
    bool _fIsAtEnd = false;
};

// One of the first rows, before the next string, can't be code.
bool BeginsBroken(CReading& reading) {
    constexpr int kFirstRows = 4;
    while (reading.BrokenCount() == 0) {
        if (reading.RowCount() == kFirstRows || reading.HasReadTriple() || reading.IsAtEnd()) return false;
        reading.ReadRow();
    }
    return true;
}

// Of two readings of the rest of the text, one of which finds strings where the other finds code, the first
// fits much worse.
bool FitsWorse(CReading& first, CReading& second) {
    constexpr int kEnoughBroken = 6;
    constexpr int kSurelyBroken = 2;
    while (!first.IsAtEnd() || !second.IsAtEnd()) {
        const bool is_behind = first.RowCount() <= second.RowCount();
        CReading& next = (is_behind && !first.IsAtEnd()) || second.IsAtEnd() ? first : second;
        next.ReadRow();
        const int worse = first.BrokenCount();
        const int better = second.BrokenCount();
        if (better >= kSurelyBroken && better >= worse) return false;
        if (worse >= kEnoughBroken && (second.IsAtEnd() || second.RowCount() >= first.RowCount())) break;
    }
    return first.BrokenCount() > 3 * second.BrokenCount();
}

// The closing quotes of the string at `pos`, which ends at `end`, rather open one.
bool IsTurnedInsideOut(CLexer& lexer, size_t pos, const CStringStart& start, size_t end, size_t& looked_at) {
    const std::string_view text = lexer.Text();
    const size_t closing = end - start.quote_length;
    const size_t next = SkipBlanks(text, end);
    const bool is_before_operand = BeginsAfterString(text, next);
    const bool is_after_code = EndsBeforeString(text.substr(pos, closing - pos + 1));
    if (is_before_operand && is_after_code) return true;
    if (!is_before_operand && !is_after_code && !HardlyFollowsString(text, next) &&
        !HardlyBeginsCode(text, SkipToNextRow(text, next))) {
        return false;
    }

    const CStringEnd opposite = FindStringEnd(text, end, start.quote, true);
    CReading as_found(lexer, pos, end);
    CReading turned(lexer, SkipPrefixBack(text, closing), opposite.end);
    as_found.NoteBroken(is_before_operand);
    turned.NoteBroken(opposite.is_closed ? 0 : kOpenEndWeight);
    const bool is_turned = (is_after_code || BeginsBroken(as_found)) && FitsWorse(as_found, turned);
    looked_at = std::max({looked_at, as_found.Pos(), turned.Pos()});
    return is_turned;
}

}  // namespace

size_t FindUnclosedTripleEnd(CLexer& lexer, size_t pos, const CStringStart& start, const CStringEnd& found,
                             size_t& looked_at) {
    const std::string_view text = lexer.Text();
    if (!found.is_closed) return FindProseEnd(lexer, pos, text.size(), looked_at);
    const size_t closing_row = pos + RowStart(text.substr(pos), found.end - pos);
    if (closing_row == pos || !IsTurnedInsideOut(lexer, pos, start, found.end, looked_at)) return 0;
    return FindProseEnd(lexer, pos, closing_row, looked_at);
}

}  // namespace codeloom
