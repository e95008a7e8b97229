#include "tokenizer/prose_end.h"

#include <algorithm>

#include "tokenizer/code_signs.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

namespace {

// The row ends with two quotes that begin no empty string: they are left of triple quotes. Such a string
// comes after a blank, an operator, an opener or a prefix of at most two letters.
bool EndsInLostQuotes(std::string_view row, char quote) {
    const size_t last = row.find_last_not_of(" \t)]},;:");
    if (last == std::string_view::npos || last == 0) return false;
    if (row[last] != quote || row[last - 1] != quote) return false;
    size_t before = last - 1;
    while (before > 0 && IsNameByte(row[before - 1])) --before;
    if (before == 0) return true;
    if (last - 1 - before > 2) return true;
    return std::string_view(" \t=([{,+%:<>|&'\"\\").find(row[before - 1]) == std::string_view::npos;
}

// Finds where prose ends and code begins: after the row up to which there is most of prose and least of
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
    void AddCode(bool is_sure) { _fBalance -= is_sure ? kSureCodeWeight : 1; }
    size_t End() const { return _fEnd; }

  private:
    // Prose often looks like code; code looks like prose only where it is broken itself.
    static constexpr int kProseWeight = 6;
    static constexpr int kSureCodeWeight = 4;

    size_t _fEnd;
    int _fBalance = 0;
    int _fBestBalance = 0;
};

size_t RowTextEnd(std::string_view text, const CTokenRow& row) {
    return static_cast<size_t>(row.text.data() - text.data()) + row.text.size();
}

}  // namespace

size_t FindProseEnd(CLexer& lexer, size_t pos, size_t end, size_t& looked_at) {
    const std::string_view text = lexer.Text();
    const int32_t indent = RowIndent(text, pos);
    size_t last_end = FindRowEnd(text, pos);
    const CStringStart start = ReadStringStart(text, pos);
    const size_t content = pos + start.ContentOffset();
    if (EndsInLostQuotes(text.substr(content, last_end - content), start.quote)) return last_end;
    CProseEnd prose(last_end);
    CRowReader reader(lexer, PlaceWithinRow(last_end));
    CTokenRow row;
    bool is_broken_code = false;
    bool is_after_prose = false;  // deeper rows of code are an example
    bool is_in_session = false;   // of the interpreter, up to a blank row
    while (reader.Next(row) && row.end <= end) {
        looked_at = std::max(looked_at, row.end);
        if (row.indent < indent && BeginsStatement(row)) break;
        is_in_session &= row.start == last_end && !BeginsStatement(row) && !IsHeader(row);
        is_in_session |= row.text.starts_with(">>>");
        last_end = row.end;
        if (IsComment(row)) continue;
        if (!row.is_in_brackets && EndsInLostQuotes(row.text, start.quote)) return RowTextEnd(text, row);
        // One broken row may be code; two in succession hardly are.
        const bool is_broken = IsBroken(row) || LooksLikeProse(row);
        is_broken_code = is_broken && !is_broken_code && HasSignsOfCode(row);
        if (is_in_session || (is_broken && !is_broken_code)) {
            prose.AddProse(RowTextEnd(text, row));
            is_after_prose = true;
            reader.ForgetBrackets();  // in prose they mean nothing
        } else if (!is_after_prose || row.indent <= indent) {
            prose.AddCode(HasCodeShape(row));
            is_after_prose = false;
        }
    }
    return prose.End();
}

}  // namespace codeloom
