#include "tokenizer/reading.h"

#include "tokenizer/code_signs.h"
#include "tokenizer/quote_context.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

CReading::CReading(CLexer& lexer, size_t pos, size_t begin)
    : _fText(lexer.Text()),
      _fReader(lexer, PlaceWithinRow(begin)),
      _fPos(begin),
      _fInBrackets(StandsInBrackets(lexer.Text(), pos)),
      _fKnowsBrackets(StandsOutsideBrackets(lexer.Text(), pos)),
      _fIndent(RowIndent(lexer.Text(), pos)) {}

int CReading::ReadRow() {
    _fIsAtEnd = !_fReader.Next(_fRow);
    if (_fIsAtEnd) return 0;
    _fPos = _fRow.end;
    if (IsComment(_fRow)) return 0;
    ++_fRowCount;
    const bool is_out_of_place = _IsOutOfPlace();
    const bool is_broken = is_out_of_place || codeloom::IsBroken(_fRow);
    if (is_out_of_place) _Reset();
    const int fit = _Fit(is_broken);
    _fIsBroken |= is_broken;
    _fIsAfterBroken = is_broken;
    _fHasReadTriple |= HasTripleQuotes(_fRow);
    _fInBrackets &= _fRow.stray_closer_end == 0;
    _NoteIndent();
    return fit;
}

// One broken row may be code; two in succession hardly are.
int CReading::_Fit(bool is_broken) const {
    int fit = !is_broken && HasCodeShape(_fRow) ? kCode : 0;
    if (is_broken) fit = !_fIsAfterBroken && HasSignsOfCode(_fRow) ? kBrokenCode : kNoCode;
    for (const CRowToken& token : _fRow.tokens) fit += _FitOfQuotes(token);
    if (EndsInOpenTriple(_fRow)) fit += kOpenEnd;
    return fit;
}

// How well the quotes of a string of many rows fit what is around them; zero for any other token.
int CReading::_FitOfQuotes(const CRowToken& token) const {
    if (token.type != kTokenId_STRING) return 0;
    const size_t start = static_cast<size_t>(token.text.data() - _fText.data());
    const size_t end = start + token.text.size();
    if (FindRowEnd(_fText, start) >= end) return 0;
    const size_t opening = start + token.text.find(token.text.back());
    const bool is_opened = EndsBeforeString(_fText.substr(0, opening + 1));
    const bool is_opened_at_end = EndsBeforeString(token.text.substr(0, token.text.size() - 2));
    const bool is_closed = !HardlyFollowsString(_fText, SkipBlanks(_fText, end), end);
    return kQuotes * ((is_opened ? 1 : -1) + (is_closed ? 1 : -1) - is_opened_at_end);
}

// The row is one of code, but not here: a statement within brackets, what isn't one outside of them, or a row
// that is deeper than its block.
bool CReading::_IsOutOfPlace() const {
    if (_fInBrackets || _fRow.is_in_brackets) return BeginsStatement(_fRow) || BeginsHeader(_fRow);
    if (!_fKnowsBrackets || !_fRow.IsWhole()) return false;
    return _fRow.indent > _fIndent || LooksLikeProse(_fRow);
}

// What was open before the row counts no more, so that each fault counts once.
void CReading::_Reset() {
    _fInBrackets = false;
    if (_fRow.is_in_brackets) _fReader.ForgetOuterBrackets();
    _fRow.is_in_brackets = false;
}

// The next row may be as deep as a statement's first row, and any depth after a header.
void CReading::_NoteIndent() {
    if (_fInBrackets || _fRow.stray_closer_end) {
        _fKnowsBrackets = false;
    } else if (!_fRow.is_in_brackets && _fRow.IsWhole()) {
        _fIndent = _fRow.indent;
        _fKnowsBrackets |= BeginsStatement(_fRow);
    }
    if (_fReader.OpenBrackets().empty() && EndsInColon(_fRow)) _fIndent = INT32_MAX;
}

}  // namespace codeloom
