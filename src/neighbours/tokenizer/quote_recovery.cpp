#include "neighbours/tokenizer/quote_recovery.h"

#include <algorithm>

#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/operands.h"
#include "neighbours/tokenizer/row_facts.h"

namespace codeloom {

namespace {

// As many broken rows as it takes to be sure.
constexpr int kEnoughBroken = 3;

constexpr auto kBeforeString = std::to_array<std::string_view>(
    {"return", "yield", "print", "assert", "raise", "in", "and", "or", "not", "else", "exec"});

// A place from which rows are read although a row doesn't begin there.
CPlace WithinRow(size_t pos) {
    return {pos, SIZE_MAX, 0, 0};
}

size_t RowStart(std::string_view text, size_t pos) {
    while (pos > 0 && !IsRowEnd(text[pos - 1])) --pos;
    return pos;
}

// The text up to `end`, which ends in ":", ends with the last row of a header.
bool EndsLikeHeader(std::string_view text, size_t end) {
    if (end > 1 && text[end - 2] == ')') return true;
    return IsCompoundWord(WordAt(text, SkipBlanks(text, RowStart(text, end - 1))));
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
    return is_on_row && keywords::IsOneOf(text.substr(word, last - word), kBeforeString);
}

// What begins at `pos` can't follow a string on its row.
bool BeginsBehindString(std::string_view text, size_t pos) {
    if (pos >= text.size()) return false;
    return StartsStatement(text, pos) || (BeginsOperand(text, pos) && !BeginsString(text, pos));
}

// The string that begins at `pos` stands directly behind an opening bracket.
bool IsBehindOpener(std::string_view text, size_t pos) {
    while (pos > 0 && IsBlank(text[pos - 1])) --pos;
    return pos > 0 && ByteKind(text[pos - 1]) == EByteKind::kOpener;
}

// The number of rows from `pos` up to the next triple quotes that can't be code, or kEnoughBroken. In
// brackets no statement can begin.
int CountBrokenRows(CLexer& lexer, size_t pos, bool in_brackets, size_t& looked_at) {
    CRowReader reader(lexer, WithinRow(pos));
    CTokenRow row;
    int count = 0;
    while (count < kEnoughBroken && reader.Next(row)) {
        looked_at = std::max(looked_at, row.end);
        count += IsBroken(row) || (in_brackets && BeginsStatement(row));
        if (HasTripleQuotes(row)) break;
        in_brackets &= row.stray_closer_end == 0;
    }
    return count;
}

// The rows around the closing quotes of the string at `pos`, which ends at `end`, fit better if these open a
// string.
bool IsTurnedInsideOut(CLexer& lexer, size_t pos, const CStringStart& start, size_t end, size_t& looked_at) {
    const std::string_view text = lexer.Text();
    const size_t closing = end - start.quote_length;
    const bool is_before_operand = BeginsBehindString(text, SkipBlanks(text, end));
    const bool is_behind_code = EndsBeforeString(text.substr(pos, closing - pos + 1));
    if (!is_before_operand && !is_behind_code) return false;
    if (is_before_operand && is_behind_code) return true;

    const int broken = is_before_operand + CountBrokenRows(lexer, end, IsBehindOpener(text, pos), looked_at);
    if (broken == 0 || (is_before_operand && broken < 2)) return false;
    const CStringEnd opposite = FindStringEnd(text, end, start.quote, true);
    looked_at = std::max(looked_at, opposite.end);
    if (!opposite.is_closed) return false;
    const bool opposite_in_brackets = IsBehindOpener(text, SkipPrefixBack(text, closing));
    const int opposite_broken = CountBrokenRows(lexer, opposite.end, opposite_in_brackets, looked_at);
    return is_behind_code ? opposite_broken < broken : opposite_broken == 0;
}

// Finds where prose ends and code begins: behind the row up to which there is most of prose and least of
// code.
class CProseEnd {
  public:
    explicit CProseEnd(size_t end) : _fEnd(end) {}

    void AddProse(size_t row_end) {
        _fBalance += kProseWeight;
        if (_fBalance < _fBestBalance) return;
        _fBestBalance = _fBalance;
        _fEnd = row_end;
    }
    void AddCode() { --_fBalance; }
    size_t End() const { return _fEnd; }

  private:
    // Prose often looks like code; code looks like prose only where it is broken itself.
    static constexpr int kProseWeight = 6;

    size_t _fEnd;
    int _fBalance = 0;
    int _fBestBalance = 0;
};

// The end of the prose in the string at `pos`, of which the rows behind its first one begin before `end`. A
// statement that is indented less than the string shows that the string is over.
size_t FindProseEnd(CLexer& lexer, size_t pos, size_t end, size_t& looked_at) {
    const std::string_view text = lexer.Text();
    CPlace place{RowStart(text, pos), 0, 0, 0};
    SkipIndent(text, place);
    const int32_t indent = place.pos == pos ? place.indent : 0;
    size_t last_end = FindRowEnd(text, pos);
    CProseEnd prose(last_end);
    CRowReader reader(lexer, WithinRow(last_end));
    CTokenRow row;
    bool is_in_session = false;  // of the interpreter, up to a blank row
    while (reader.Next(row) && row.end <= end) {
        looked_at = std::max(looked_at, row.end);
        if (row.indent < indent && BeginsStatement(row)) break;
        is_in_session &= row.start == last_end;
        is_in_session |= row.text.starts_with(">>>");
        last_end = row.end;
        if (IsBroken(row) || LooksLikeProse(row) || is_in_session) {
            prose.AddProse(static_cast<size_t>(row.text.data() - text.data()) + row.text.size());
            reader.ForgetBrackets();  // in prose they mean nothing
        } else if (!IsComment(row)) {
            prose.AddCode();
        }
    }
    return prose.End();
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
