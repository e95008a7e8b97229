#include "tokenizer/tokenizer.h"

#include <algorithm>
#include <array>
#include <stdexcept>

#include "text/token_type.h"
#include "tokenizer/keywords.h"
#include "tokenizer/logical_type.h"
#include "tokenizer/operands.h"
#include "tokenizer/recovery.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

// The types of the operators that say what their line is, or may embed: `=` and its like, ":" and "->".
constexpr auto kIsNoted = [] {
    std::array<bool, 256> is_noted{};
    for (size_t type = 0; type < is_noted.size(); ++type)
        is_noted[type] =
            type == kTokenId_RARROW || IsAssignmentOperator(static_cast<int16_t>(type), EWord::kNone);
    return is_noted;
}();

CRowToken LastRowToken(const CRawLogical& logical) {
    const CRawToken last = FindLastSignificant(logical.tokens);
    return {logical.Text(last), last.type, last.word};
}

}  // namespace

CTokenizer::CTokenizer(std::string_view text, size_t start, bool is_in_class)
    : _fLexer(text), _fEmbedded(text) {
    if (text.size() > kMaxTextSize)
        throw std::length_error("a source text must be shorter than 2 GB; split it into several texts");
    if (start == 0 && text.starts_with(kByteOrderMark)) start = kByteOrderMark.size();
    _fPlace.pos = _fPlace.row_start = start;
    if (is_in_class) _fScopes.EnterClass();
}

bool CTokenizer::NextLogical(CRawLogical& logical) {
    const std::string_view text = _fLexer.Text();
    if (!logical.embedded.empty()) _fEmbedded.Clear(logical);
    _Restart(logical);
    logical.file_text = text;
    const bool is_mid_row = _fMidRow;
    if (!_SkipToLogical()) return false;

    logical.first_row = _fPlace.row;
    logical.origin = {_fPlace.row, 0};
    logical.is_indented_by_spaces = !is_mid_row && _fPlace.is_indented_by_spaces;
    if (text[_fPlace.pos] == '#') {
        _CollectComment(logical);
    } else {
        _CollectStatement(logical);
    }
    logical.words = _fFacts.words;
    logical.may_have_strings = _fFacts.has_strings;
    logical.may_have_special_strings = _fFacts.has_special_strings;
    logical.may_have_comments = _fFacts.embedding.has_comments;
    _fScopes.Visit(logical, _fIndent, is_mid_row);
    if (_fFacts.embedding.Any()) _fEmbedded.Find(logical, _fFacts.embedding);
    return true;
}

void CTokenizer::_Restart(CRawLogical& logical) {
    logical.tokens.clear();
    _fFacts = {};
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
    if (!_CollectTokens(logical, kUpToEnd)) {
        _fLexer.NoteLook(_fPlace.pos);
        _fBrackets.RememberUnclosed();
        _fPlace = start;
        _Restart(logical);
        _CollectTokens(logical, FindRecoveredEnd(_fLexer, start));
    }
    logical.type = TypeOfBeginning(logical);
    if (logical.type == ELogicalType::kUnknown && _fFacts.is_assignment)
        logical.type = ELogicalType::kAssignment;
}

// Adds tokens up to the end of the logical line, and moves after it; false when its brackets prove to be
// unclosed. Most tokens are plain names, brackets and operators, which are read here and now.
bool CTokenizer::_CollectTokens(CRawLogical& logical, size_t forced_end) {
    const std::string_view text = _fLexer.Text();
    _fBrackets.Clear();
    for (;;) {
        size_t pos = _fPlace.pos;
        char c = ByteAt(text, pos);
        while (c == ' ') c = ByteAt(text, ++pos);
        _fPlace.pos = pos;
        switch (ByteKind(c)) {
            case EByteKind::kNameStart:
                _AddName(logical, text);
                break;
            case EByteKind::kOpener:
                _Add(logical, pos + 1, BracketType(c), EWord::kNone);
                ++_fFacts.depth;
                if (!_fBrackets.Open(c, pos) && forced_end == kUpToEnd) return false;
                break;
            case EByteKind::kCloser:
                _Add(logical, pos + 1, BracketType(c), EWord::kNone);
                --_fFacts.depth;
                if (!_fBrackets.Close(c) && forced_end == kUpToEnd) return false;
                break;
            case EByteKind::kOperator:
                if (c == ';' && !_IsOpen(forced_end) && _IsSeparator(logical)) {
                    _EndAtSeparator(logical);
                    return true;
                }
                _AddOperator(logical, text);
                break;
            case EByteKind::kBlank:
                ++_fPlace.pos;
                break;
            case EByteKind::kDot:
                if (IsDigit(ByteAt(text, pos + 1))) {
                    _AddToken(logical);
                } else {
                    _AddOperator(logical, text);
                }
                break;
            default:
                if (pos < text.size() && !IsRowEnd(c)) {
                    _AddToken(logical);
                } else if (const EStep step = _SkipRows(logical, forced_end); step != EStep::kToken) {
                    return step == EStep::kEnd;
                }
        }
    }
}

// Moves from the end of a row, or of the text, to the next token of the logical line, or after the row that
// ends it.
CTokenizer::EStep CTokenizer::_SkipRows(const CRawLogical& logical, size_t forced_end) {
    const std::string_view text = _fLexer.Text();
    for (;;) {
        if (_fPlace.pos >= text.size()) return _IsOpen(forced_end) ? EStep::kUnclosed : EStep::kEnd;
        if (!SkipRowEnd(text, _fPlace)) break;
        if (!_IsOpen(forced_end) && _fPlace.pos >= forced_end) return EStep::kEnd;
        SkipBlankRows(text, _fPlace);
        if (forced_end != kUpToEnd && _fPlace.row_start >= forced_end) {
            _fPlace.pos = _fPlace.row_start;
            return EStep::kEnd;
        }
    }
    return _IsOpen(forced_end) && _ProvesUnclosed(logical) ? EStep::kUnclosed : EStep::kToken;
}

inline void CTokenizer::_Add(CRawLogical& logical, size_t end, int16_t type, EWord word) {
    const auto start = static_cast<uint32_t>(_fPlace.pos);
    const CPosition position{_fPlace.row - logical.first_row, _fPlace.Column()};
    logical.tokens.emplace_back(start, static_cast<uint32_t>(end) - start, position, type, word);
    _fPlace.pos = end;
}

inline void CTokenizer::_AddName(CRawLogical& logical, std::string_view text) {
    const size_t pos = _fPlace.pos;
    if (const size_t length = ShortNameLength(text, pos); length != 0) [[likely]] {
        if (HasTrait(text[pos + length], kMayContinueName)) [[unlikely]]
            return _AddToken(logical);
        return _AddWord(logical, length, WordInside(text, pos, length));
    }
    const size_t end = SkipNameBytes(text, pos);
    if (HasTrait(ByteAt(text, end), kMayContinueName)) return _AddToken(logical);
    _AddWord(logical, end - pos, WordOfPart(text, pos, end - pos));
}

inline void CTokenizer::_AddWord(CRawLogical& logical, size_t length, EWord word) {
    const size_t pos = _fPlace.pos;
    _Add(logical, pos + length, kTokenId_NAME, word);
    _fFacts.words |= WordBits(word);
    if (length == kDebugName.size() && _fLexer.Text()[pos] == '_') [[unlikely]]
        _fFacts.words |= kDebugNameBit;
    if (word == EWord::kLambda) [[unlikely]]
        _NoteLambda();
}

inline void CTokenizer::_AddOperator(CRawLogical& logical, std::string_view text) {
    const COperator op = OperatorAt(text, _fPlace.pos);
    if (op.length == 0) [[unlikely]]
        return _AddToken(logical);
    _Add(logical, _fPlace.pos + op.length, op.type, op.word);
    if (kIsNoted[static_cast<size_t>(op.type)]) _NoteSign(op);
}

void CTokenizer::_AddToken(CRawLogical& logical) {
    const size_t pos = _fPlace.pos;
    const CLexedToken token = _fLexer.Lex(pos);
    _Add(logical, token.end, token.type, token.word);
    _Note(pos, token);
}

// Takes note of a token of any kind but the most frequent ones. It may hold rows.
void CTokenizer::_Note(size_t pos, CLexedToken token) {
    const std::string_view text = _fLexer.Text();
    switch (token.type) {
        case kTokenId_STRING:
            _fFacts.has_strings = true;
            _fFacts.has_special_strings |= token.is_special;
            _fFacts.embedding.has_strings |= _fFacts.has_hint_sign;
            _fFacts.embedding.has_fields |= token.has_fields;
            [[fallthrough]];
        case kTokenId_ERRORTOKEN:
            if (!token.may_span_rows) break;
            _fPlace.pos = pos;
            SkipRows(text, token.end, _fPlace);
            _fPlace.pos = token.end;
            break;
        case kTokenId_COMMENT:
            _fFacts.embedding.has_comments = true;
            break;
        case kTokenId_BACKSLASH:
            SkipRowEnd(text, _fPlace);
            break;
        default:
            _fFacts.words |= WordBits(token.word);
            if (token.word == EWord::kLambda) _NoteLambda();
    }
}

// An assignment sign outside brackets that isn't a lambda's makes the line an assignment.
inline void CTokenizer::_NoteSign(COperator op) {
    CLineFacts& facts = _fFacts;
    facts.has_hint_sign |= op.type == kTokenId_COLON || op.type == kTokenId_RARROW;
    if (facts.depth != 0 || facts.is_assignment || op.word == EWord::kArrow) return;
    facts.is_assignment = facts.open_lambdas == 0;
    if (op.type == kTokenId_COLON) --facts.open_lambdas;
}

// The ";" at the place ends a logical line. One that ends none is a token, and a fault. One in a row
// whose quotes don't match may as well be in a string, and ends nothing either.
bool CTokenizer::_IsSeparator(const CRawLogical& logical) {
    if (_fIsCompound || FindLastSignificant(logical.tokens).length == 0 || _HasOpenQuote()) return false;
    _fIsCompound = IsCompound(logical);
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
// or with an operand although the row before ends with one. Deeper rows may lack a comma: they are believed
// to lie within the brackets of a simple statement, and of a header that is closed as headers are.
bool CTokenizer::_ProvesUnclosed(const CRawLogical& logical) {
    const std::string_view text = _fLexer.Text();
    if (StartsStatement(text, _fPlace.pos)) return true;
    if (MayBeginHeader(text, _fPlace.pos)) return _BeginsHeader(logical);
    const CRawToken& first = logical.tokens.front();
    const bool is_deeper = _fPlace.indent > _fIndent;
    if (is_deeper && !IsCompoundWord(first.word)) return false;
    const CRowToken before = LastRowToken(logical);
    if (before.type == kTokenId_COLON && _EndsHeader(logical)) return true;
    const bool is_print = WordAt(text, _fPlace.pos) == EWord::kPrint && IsOperandEnd(before);
    if (!is_print && !AreOperandsSideBySide(before, text, _fPlace.pos)) return false;
    return !is_deeper || !ClosesBrackets(_fLexer, first.start);
}

bool CTokenizer::_BeginsHeader(const CRawLogical& logical) {
    CTokenRow row;
    CRowReader(_fLexer, _fPlace).Next(row);
    row.before = LastRowToken(logical);
    return BeginsHeader(row) || BeginsStatement(row);
}

// The ":" that the rows end with can't be in the parentheses that are open, so it is the header's.
bool CTokenizer::_EndsHeader(const CRawLogical& logical) const {
    if (_fBrackets.Innermost() != ')' || !IsCompoundWord(logical.tokens.front().word)) return false;
    return std::none_of(logical.tokens.begin(), logical.tokens.end(), [](const CRawToken& token) {
        return token.word == EWord::kLambda || token.word == EWord::kDef;
    });
}

}  // namespace codeloom
