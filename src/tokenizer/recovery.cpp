#include "tokenizer/recovery.h"

#include <cstdint>
#include <utility>

#include "tokenizer/keywords.h"
#include "tokenizer/operands.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

namespace {

// A header of more rows than this isn't believed, so that looking for its end takes bounded time.
constexpr int kMostHeaderRows = 200;

// Decides row by row whether a simple statement goes on.
class CStatementRows {
  public:
    enum class EAnswer { kYes, kIfClosed, kNo };

    CStatementRows(const CTokenRow& first, int32_t indent, bool is_body)
        : _fIndent(indent), _fIsBody(is_body) {
        _Note(first);
    }

    // Rows indented deeper belong to the statement, those that nothing can begin with, and the entries of a
    // display that isn't indented. The last entry needs no comma, and is one only before the closing bracket.
    EAnswer Continues(const CTokenRow& row) {
        EAnswer answer = EAnswer::kYes;
        if (row.indent > _fIndent) {
            if (_fIsBody && BeginsStatement(row)) return EAnswer::kNo;
        } else if (!ContinuesExpression(row)) {
            if (!_MayBeEntry(row)) return EAnswer::kNo;
            if (!EndsOpenByItself(row) && !ClosesOuterBracket(row)) answer = EAnswer::kIfClosed;
        }
        _Note(row);
        return answer;
    }

  private:
    void _Note(const CTokenRow& row) { _fEndsOpen = EndsOpen(row); }

    bool _MayBeEntry(const CTokenRow& row) const {
        return _fEndsOpen && !BeginsStatement(row) && !BeginsWithTwoOperands(row) && !AssignsToPart(row);
    }

    int32_t _fIndent;
    bool _fIsBody;            // follows a header
    bool _fEndsOpen = false;  // the row before does
};

// The end of a simple statement. Comment rows belong to it only if a row after them does.
size_t FindStatementEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    CStatementRows rows(row, place.indent, HasBody(row));
    size_t end = row.end;
    bool is_doubtful = false;  // the rows from `end` on belong to the statement only if what follows does
    bool needs_closer = false;
    while (reader.Next(row)) {
        if (IsComment(row)) {
            is_doubtful = true;
        } else {
            if (needs_closer && !BeginsWithCloser(row)) break;
            const CStatementRows::EAnswer answer = rows.Continues(row);
            if (answer == CStatementRows::EAnswer::kNo) break;
            is_doubtful = needs_closer = answer == CStatementRows::EAnswer::kIfClosed;
        }
        if (!is_doubtful) end = row.end;
    }
    return end;
}

// The row begins after the last parameter: `) -> int: pass`, the bracket perhaps missing.
bool EndsParameters(const CTokenRow& row) {
    return BeginsWithCloser(row) || row.text.starts_with("->");
}

// Finds where a compound header ends, row by row.
class CHeaderRows {
  public:
    CHeaderRows(const CTokenRow& first, int32_t indent)
        : _fIndent(indent), _fHasParameters(BeginsDefinition(first)), _fEnd(first.end) {}

    // The end of the header as far as the rows show.
    size_t End() const { return _fEnd; }

    // Takes the next row, which with the comments before it begins at `start`; false when the end is known.
    // The depths are the numbers of brackets open before the row and after it.
    bool Continues(const CTokenRow& row, size_t start, size_t depth_before, size_t depth) {
        if (_fMayBeNested) {
            if (row.indent > _fNestedIndent) _fEnd = _fBodyStart;
            return false;
        }
        if (row.indent <= _fIndent && !ContinuesExpression(row)) return false;
        _NoteBody(row, start);
        if (_BeginsBody(row)) return false;
        if (IsCompoundWord(WordAt(row.text, 0))) {
            _fNestedIndent = row.indent;
            _fNestedDepth = depth_before;
        }
        if (!EndsInOuterColon(row) && !(EndsParameters(row) && HasBody(row))) return true;
        _fEnd = row.end;
        return _fMayBeNested = _fNestedDepth == depth;
    }

  private:
    // The body begins with the first of the least indented rows.
    void _NoteBody(const CTokenRow& row, size_t start) {
        if (row.indent >= _fBodyIndent) return;
        _fBodyIndent = row.indent;
        _fEnd = _fBodyStart = start;
    }

    bool _BeginsBody(const CTokenRow& row) const {
        if (BeginsStatement(row) || FollowsOperand(row)) return true;
        if (_fHasParameters && BeginsString(row.text, 0)) return true;
        return BeginsHeader(row) && HasBody(row);
    }

    int32_t _fIndent;
    bool _fHasParameters;
    size_t _fEnd;
    size_t _fBodyStart = 0;
    int32_t _fBodyIndent = INT32_MAX;
    // The last row that began like a header. It is one, below a header that isn't closed, if the row after
    // its ":" is indented deeper; else its word continues an expression of the header.
    int32_t _fNestedIndent = 0;
    size_t _fNestedDepth = SIZE_MAX;
    bool _fMayBeNested = false;  // its ":" ended the row before
};

// The end of a compound header whose rows begin at `place`: after the first row that ends in ":", or else
// before the body, that is before the first of the least indented rows among those that are deeper than the
// header.
size_t FindHeaderEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    CHeaderRows rows(row, place.indent);
    if (EndsInColon(row)) return rows.End();
    size_t start = 0;  // of the comments before the row
    size_t depth = reader.OpenBrackets().size();
    for (int row_count = 1; row_count < kMostHeaderRows && reader.Next(row); ++row_count) {
        if (start == 0) start = row.start;
        if (IsComment(row)) continue;
        const size_t depth_before = std::exchange(depth, reader.OpenBrackets().size());
        if (!rows.Continues(row, start, depth_before, depth)) break;
        start = 0;
    }
    return rows.End();
}

// A row that ends as headers do, although it doesn't begin with a keyword: that may be lost. A dictionary may
// end a row so too. `open_brackets` are those after the row.
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
    const bool is_header = IsCompoundWord(WordAt(row.text, 0)) ? !HasBody(row) || EndsAfterColon(row)
                                                               : IsSpoiltHeader(row, reader.OpenBrackets());
    return is_header ? FindHeaderEnd(lexer, place) : FindStatementEnd(lexer, place);
}

bool ClosesBrackets(CLexer& lexer, size_t pos) {
    CRowReader reader(lexer, PlaceWithinRow(pos));
    CTokenRow row;
    int row_count = 0;
    do {
        if (row_count++ == kMostHeaderRows || !reader.Next(row)) return false;
    } while (!reader.OpenBrackets().empty());
    const bool begins_header = row_count > 1 && IsCompoundWord(WordAt(row.text, 0));
    return !begins_header && HasOuterColon(row);
}

}  // namespace codeloom
