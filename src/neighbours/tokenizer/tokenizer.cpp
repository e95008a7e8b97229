#include "neighbours/tokenizer/tokenizer.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/logical_type.h"
#include "neighbours/tokenizer/operands.h"
#include "neighbours/tokenizer/recovery.h"
#include "neighbours/tokenizer/row_facts.h"

namespace codeloom {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

}  // namespace

CTokenizer::CTokenizer(std::string_view text) : _fLexer(text), _fEmbedded(text) {
    if (text.starts_with(kByteOrderMark)) _fPlace.pos = _fPlace.row_start = kByteOrderMark.size();
}

bool CTokenizer::NextLogical(CRawLogical& logical) {
    _fEmbedded.Clear(logical);
    _Restart(logical);
    const bool is_mid_row = _fMidRow;
    if (!_SkipToLogical()) return false;

    logical.first_row = _fPlace.row;
    logical.origin = {_fPlace.row, 0};
    if (_fLexer.Text()[_fPlace.pos] == '#') {
        _CollectComment(logical);
    } else {
        _CollectStatement(logical);
    }
    _fScopes.Visit(logical, _fIndent, is_mid_row);
    _fEmbedded.Find(logical, _fEmbedding);
    return true;
}

void CTokenizer::_Restart(CRawLogical& logical) {
    logical.tokens.clear();
    _fLast = {};
    _fEmbedding = {};
}

bool CTokenizer::_SkipToLogical() {
    if (_fMidRow) {
        _fMidRow = false;
        return true;
    }
    if (!SkipBlankRows(_fLexer.Text(), _fPlace)) return false;
    _fIndent = _fPlace.indent;
    return true;
}

void CTokenizer::_CollectComment(CRawLogical& logical) {
    _AddToken(logical);
    SkipRowEnd(_fLexer.Text(), _fPlace);
    logical.type = ELogicalType::kComment;
}

void CTokenizer::_CollectStatement(CRawLogical& logical) {
    const CPlace start = _fPlace;
    _fIsCompound = false;
    CReach reach;
    do {
        if (!_CollectTokens(logical, reach)) {
            _fBrackets.RememberUnclosed();
            _fPlace = start;
            _Restart(logical);
            _CollectTokens(logical, {FindRecoveredEnd(_fLexer, start), true});
            break;
        }
        reach.until = _FindStrayCloserBehind(logical);
    } while (reach.until);
    logical.type = FindLogicalType(logical.tokens);
}

// A closing bracket without an opening one in the rows behind the logical line, deeper than it, shows that
// the line goes on up to there: its opening bracket is lost. Sound text has no such rows, a header's body
// apart.
size_t CTokenizer::_FindStrayCloserBehind(const CRawLogical& logical) {
    const std::string_view text = _fLexer.Text();
    CPlace next = _fPlace;
    if (_fMidRow || !SkipBlankRows(text, next) || next.pos < _fNoStrayCloserBefore) return 0;
    if (next.indent <= _fIndent) {
        const bool is_closer = ByteKind(text[next.pos]) == EByteKind::kCloser;
        if (!is_closer || !_EndsDeeper(logical)) return 0;
    }
    if (_fLast.text == ":" && IsCompoundWord(logical.tokens[0].text)) return 0;
    return FindStrayCloser(_fLexer, next, _fIndent, _fNoStrayCloserBefore);
}

// The last row of the logical line is indented deeper than its first one.
bool CTokenizer::_EndsDeeper(const CRawLogical& logical) const {
    const CRawToken& last = logical.tokens.back();
    if (last.position.row == 0) return false;
    const std::string_view text = _fLexer.Text();
    CPlace row;
    row.pos = static_cast<size_t>(last.text.data() - text.data()) - static_cast<size_t>(last.position.col);
    SkipIndent(text, row);
    return row.indent > _fIndent;
}

// Adds tokens up to the end of the logical line, and moves behind it; false when its brackets prove to be
// unclosed.
bool CTokenizer::_CollectTokens(CRawLogical& logical, const CReach& reach) {
    const std::string_view text = _fLexer.Text();
    _fBrackets.Clear();
    for (;;) {
        const EStep step = _SkipToToken(reach);
        if (step != EStep::kToken) return step == EStep::kEnd;
        const char c = text[_fPlace.pos];
        if (c == ';' && !_IsOpen(reach) && _IsSeparator(logical)) {
            _EndAtSeparator(logical);
            return true;
        }
        if (!_fBrackets.Visit(c, _fPlace.pos) && !reach.ends_there) return false;
        _AddToken(logical);
        if (logical.tokens.back().type == kTokenId_BACKSLASH) SkipRowEnd(text, _fPlace);
    }
}

// Moves to the next token of the logical line, or behind the row that ends it.
CTokenizer::EStep CTokenizer::_SkipToToken(const CReach& reach) {
    const std::string_view text = _fLexer.Text();
    bool is_row_start = false;
    for (;;) {
        _fPlace.pos = SkipBlanks(text, _fPlace.pos);
        if (_fPlace.pos >= text.size()) return _IsOpen(reach) ? EStep::kUnclosed : EStep::kEnd;
        if (!SkipRowEnd(text, _fPlace)) break;
        if (!_IsOpen(reach) && _fPlace.pos >= reach.until) return EStep::kEnd;
        SkipBlankRows(text, _fPlace);
        if (reach.ends_there && _fPlace.row_start >= reach.until) {
            _fPlace.pos = _fPlace.row_start;
            return EStep::kEnd;
        }
        is_row_start = true;
    }
    return is_row_start && _IsOpen(reach) && _ProvesUnclosed() ? EStep::kUnclosed : EStep::kToken;
}

void CTokenizer::_AddToken(CRawLogical& logical) {
    const std::string_view text = _fLexer.Text();
    const size_t pos = _fPlace.pos;
    const CLexedToken token = _fLexer.Lex(pos);
    logical.tokens.push_back(
        {text.substr(pos, token.end - pos), {_fPlace.row - logical.first_row, _fPlace.Column()}, token.type});
    _fEmbedding.has_fields |= token.has_fields;
    _fEmbedding.has_strings |= token.type == kTokenId_STRING;
    _fEmbedding.has_comments |= token.type == kTokenId_COMMENT;
    if (token.type != kTokenId_COMMENT && token.type != kTokenId_BACKSLASH) _fLast = logical.tokens.back();
    if (token.may_span_rows) SkipRows(text, token.end, _fPlace);
    _fPlace.pos = token.end;
}

// The ";" at the place parts two logical lines. One that parts nothing is a token, and a fault. One in a row
// whose quotes don't match may as well stand in a string, and parts nothing either.
bool CTokenizer::_IsSeparator(const CRawLogical& logical) {
    if (_fIsCompound || _fLast.text.empty() || _HasOpenQuote()) return false;
    _fIsCompound = IsCompound(logical.tokens);
    return !_fIsCompound;
}

// The row of the place ends with a string that isn't closed. Looks at each row once.
bool CTokenizer::_HasOpenQuote() {
    if (_fPlace.pos < _fQuotesKnownUpTo) return _fHasOpenQuote;
    CTokenRow row;
    CRowReader(_fLexer, _fPlace).Next(row);
    _fQuotesKnownUpTo = row.end;
    return _fHasOpenQuote = HasOpenQuote(row);
}

void CTokenizer::_EndAtSeparator(CRawLogical& logical) {
    const std::string_view text = _fLexer.Text();
    _fPlace.pos = SkipBlanks(text, _fPlace.pos + 1);
    if (ByteAt(text, _fPlace.pos) == '#') _AddToken(logical);
    _fMidRow = _fPlace.pos < text.size() && !SkipRowEnd(text, _fPlace);
}

// The row that begins at the place can't lie inside the brackets that are open: it begins with a statement,
// or, no deeper than the logical line, with an operand although the row before ends with one.
bool CTokenizer::_ProvesUnclosed() const {
    if (StartsStatement(_fLexer.Text(), _fPlace.pos)) return true;
    if (_fPlace.indent > _fIndent) return false;
    return AreOperandsSideBySide(_fLast, _fLexer.Text(), _fPlace.pos);
}

}  // namespace codeloom
