#include "neighbours/tokenizer/recovery.h"

#include <algorithm>

#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/row_facts.h"

namespace codeloom {

namespace {

// A header of more rows than this isn't believed, so that looking for its end takes bounded time.
constexpr int kMostHeaderRows = 200;

// Decides row by row whether a simple statement goes on.
class CStatementRows {
  public:
    CStatementRows(const CTokenRow& first, int32_t indent) : _fIndent(indent) { _Note(first); }

    // Rows indented deeper belong to the statement, those that nothing can begin with, and the entries of a
    // display that isn't indented.
    bool Continue(const CTokenRow& row) {
        if (row.indent <= _fIndent && !ContinuesExpression(row)) {
            if (!_IsEntry(row)) return false;
            _fIsInDisplay = true;
        }
        _Note(row);
        return true;
    }

  private:
    void _Note(const CTokenRow& row) { _fMayEnter = EndsOpen(row); }

    bool _IsEntry(const CTokenRow& row) const {
        if (!_fMayEnter || BeginsStatement(row) || BeginsWithTwoOperands(row)) return false;
        return EndsOpenByItself(row) || ClosesOuterBracket(row) || (_fIsInDisplay && !HasAssignment(row));
    }

    int32_t _fIndent;
    bool _fMayEnter = false;     // the row before ends open
    bool _fIsInDisplay = false;  // of entries that aren't indented
};

// The end of a simple statement. Comment rows directly before the row that ends it stay outside, unless they
// are indented deeper.
size_t FindStatementEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    CStatementRows rows(row, place.indent);
    size_t end = row.end;
    bool is_behind_comment = false;  // one that may stay outside
    while (reader.Next(row)) {
        if (IsComment(row)) {
            is_behind_comment |= row.indent <= place.indent;
            if (!is_behind_comment) end = row.end;
        } else {
            if (!rows.Continue(row)) break;
            is_behind_comment = false;
            end = row.end;
        }
    }
    return end;
}

// The row begins behind the last parameter: `) -> int: pass`, the bracket perhaps missing.
bool EndsParameters(const CTokenRow& row) {
    return BeginsWithCloser(row) || row.text.starts_with("->");
}

// The end of a compound header whose rows begin at `place`: behind the first row that ends in ":", or else
// before the body, that is before the first of the least indented rows among those that are deeper than the
// header.
size_t FindHeaderEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    size_t body_start = row.end;
    size_t comments_start = 0;
    int32_t body_indent = INT32_MAX;
    for (int row_count = 0; row_count < kMostHeaderRows; ++row_count) {
        if (row_count > 0 && (BeginsStatement(row) || FollowsOperand(row))) break;
        if (EndsInColon(row) || (row_count > 0 && EndsParameters(row) && HasBody(row))) return row.end;
        if (!reader.Next(row)) break;
        if (IsComment(row)) {
            if (comments_start == 0) comments_start = row.start;
            continue;
        }
        if (row.indent <= place.indent && !ContinuesExpression(row)) break;
        if (row.indent < body_indent) {
            body_indent = row.indent;
            body_start = comments_start ? comments_start : row.start;
        }
        comments_start = 0;
    }
    return body_start;
}

// A row that ends as headers do, although it doesn't begin with a keyword: that may be lost. A dictionary may
// end a row so too. `open_brackets` are those behind the row.
bool IsSpoiltHeader(const CTokenRow& row, const std::vector<char>& open_brackets) {
    if (!EndsInColon(row)) return false;
    const bool begins_with_bracket = ByteKind(row.text.front()) == EByteKind::kOpener;
    return begins_with_bracket || open_brackets.empty() || open_brackets.back() != '}';
}

}  // namespace

size_t FindRecoveredEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    const bool is_header =
        IsCompoundWord(WordAt(row.text, 0)) ? !HasBody(row) : IsSpoiltHeader(row, reader.OpenBrackets());
    return is_header ? FindHeaderEnd(lexer, place) : FindStatementEnd(lexer, place);
}

size_t FindStrayCloser(CLexer& lexer, const CPlace& place, int32_t indent, size_t& looked_at) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    while (reader.Next(row)) {
        looked_at = row.start;
        const bool is_deeper = row.indent > indent;
        if (!is_deeper && !row.is_in_brackets && !BeginsWithCloser(row)) return 0;
        if (BeginsStatement(row) || (!is_deeper && BeginsWithTwoOperands(row))) return 0;
        if (row.stray_closer_end) return row.stray_closer_end;
    }
    looked_at = lexer.Text().size();
    return 0;
}

}  // namespace codeloom
