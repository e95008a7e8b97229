#include "grammar/grammar_text.h"

#include <map>
#include <utility>

namespace codeloom {

namespace {

bool IsNameStart(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

bool IsNamePart(char c) {
    return IsNameStart(c) || (c >= '0' && c <= '9');
}

enum class EPiece { kName, kQuoted, kMark, kRowEnd, kTextEnd };

// One piece of the text: a name, a quoted text, one of the marks `:|[]()*+`, or an end.
struct CPiece {
    EPiece kind;
    std::string_view text;  // without quotes
    int row;

    bool IsMark(char mark) const { return kind == EPiece::kMark && text.front() == mark; }

    std::string Shown() const {
        switch (kind) {
            case EPiece::kRowEnd:
                return "the end of the row";
            case EPiece::kTextEnd:
                return "the end of the file";
            default:
                return "'" + std::string(text) + "'";
        }
    }
};

// Cuts the text into pieces. Ends of rows within brackets aren't pieces.
class CPieceReader {
  public:
    CPieceReader(const std::string& file_name, std::string_view text) : _fFileName(file_name), _fText(text) {
        Advance();
    }

    const CPiece& Current() const { return _fCurrent; }

    void Advance() {
        _SkipBlanksAndComment();
        if (_fPos == _fText.size()) {
            _fCurrent = {EPiece::kTextEnd, {}, _fRow};
        } else if (const char c = _fText[_fPos]; c == '\n') {
            _fCurrent = {EPiece::kRowEnd, _Take(1), _fRow++};
        } else if (IsNameStart(c)) {
            size_t end = _fPos;
            while (end < _fText.size() && IsNamePart(_fText[end])) ++end;
            _fCurrent = {EPiece::kName, _Take(end - _fPos), _fRow};
        } else if (c == '\'' || c == '"') {
            _fCurrent = {EPiece::kQuoted, _TakeQuoted(c), _fRow};
        } else {
            _TakeMark(c);
        }
    }

    [[noreturn]] void RaiseExpected(const std::string& expected) const {
        throw CGrammarError(_fFileName, _fCurrent.row,
                            "expected " + expected + ", found " + _fCurrent.Shown());
    }

  private:
    // How deep brackets may be nested. The reader of a rule calls itself for each.
    static constexpr int kMaxDepth = 100;

    void _SkipBlanksAndComment() {
        while (_fPos < _fText.size()) {
            const char c = _fText[_fPos];
            if (c == '#') {
                while (_fPos < _fText.size() && _fText[_fPos] != '\n') ++_fPos;
            } else if (c == '\n' && _fDepth > 0) {
                ++_fPos;
                ++_fRow;
            } else if (c == ' ' || c == '\t' || c == '\r' || c == '\f') {
                ++_fPos;
            } else {
                return;
            }
        }
    }

    std::string_view _Take(size_t length) {
        const std::string_view taken = _fText.substr(_fPos, length);
        _fPos += length;
        return taken;
    }

    std::string_view _TakeQuoted(char quote) {
        const std::string_view rest = _fText.substr(_fPos + 1);
        const size_t length = rest.find_first_of(quote == '"' ? "\"\n" : "'\n");
        if (length == std::string_view::npos || rest[length] != quote)
            throw CGrammarError(_fFileName, _fRow,
                                std::string("expected a closing ") + quote + " in this row");
        if (length == 0)
            throw CGrammarError(_fFileName, _fRow, "expected a keyword or operator between the quotes");
        return _Take(length + 2).substr(1, length);
    }

    void _TakeMark(char c) {
        if (std::string_view(":|[]()*+").find(c) == std::string_view::npos)
            throw CGrammarError(
                _fFileName, _fRow,
                std::string("expected a name, a quoted text or one of : | [ ] ( ) * +, found '") + c + "'");
        if (c == '(' || c == '[') ++_fDepth;
        if (c == ')' || c == ']') --_fDepth;
        if (_fDepth < 0) throw CGrammarError(_fFileName, _fRow, std::string("'") + c + "' closes no bracket");
        if (_fDepth > kMaxDepth) throw CGrammarError(_fFileName, _fRow, "the brackets are nested too deep");
        _fCurrent = {EPiece::kMark, _Take(1), _fRow};
    }

    const std::string& _fFileName;
    std::string_view _fText;
    size_t _fPos = 0;
    int _fRow = 1;
    int _fDepth = 0;
    CPiece _fCurrent{};
};

// Reads the rules, and builds the automaton of each while it reads:
//
//   rules         (row end | rule)*
//   rule          NAME ':' alternatives row end
//   alternatives  sequence ('|' sequence)*
//   sequence      repeated+
//   repeated      item ['*' | '+']
//   item          NAME | quoted text | '(' alternatives ')' | '[' alternatives ']'
class CRulesReader {
  public:
    CRulesReader(const std::string& file_name, std::string_view text) : _fPieces(file_name, text) {
        _fResult.file_name = file_name;
    }

    CGrammarText Read() {
        while (_Current().kind != EPiece::kTextEnd) {
            if (_Current().kind == EPiece::kRowEnd) {
                _fPieces.Advance();
            } else {
                _ReadRule();
            }
        }
        if (_fResult.rules.empty()) _fPieces.RaiseExpected("a rule");
        return std::move(_fResult);
    }

  private:
    const CPiece& _Current() const { return _fPieces.Current(); }

    void _ReadRule() {
        if (_Current().kind != EPiece::kName) _fPieces.RaiseExpected("the name of a rule");
        CRuleText rule{std::string(_Current().text), _Current().row, CNfa()};
        _fPieces.Advance();
        _TakeMark(':', "':' after the name of the rule");
        _fAutomaton = &rule.automaton;
        rule.automaton.fWhole = _ReadAlternatives();
        if (_Current().kind != EPiece::kRowEnd && _Current().kind != EPiece::kTextEnd)
            _fPieces.RaiseExpected("the end of the rule");
        _fResult.rules.push_back(std::move(rule));
    }

    void _TakeMark(char mark, const char* expected) {
        if (!_Current().IsMark(mark)) _fPieces.RaiseExpected(expected);
        _fPieces.Advance();
    }

    // No arc leads into the start of a span, and none leaves its end, until it is joined to others.
    CNfaSpan _NewSpan() { return {_fAutomaton->AddState(), _fAutomaton->AddState()}; }

    CNfaSpan _ReadAlternatives() {
        const CNfaSpan first = _ReadSequence();
        if (!_Current().IsMark('|')) return first;
        const CNfaSpan all = _NewSpan();
        const auto add = [&](CNfaSpan alternative) {
            _fAutomaton->AddEmptyArc(all.start, alternative.start);
            _fAutomaton->AddEmptyArc(alternative.end, all.end);
        };
        add(first);
        while (_Current().IsMark('|')) {
            _fPieces.Advance();
            add(_ReadSequence());
        }
        return all;
    }

    CNfaSpan _ReadSequence() {
        CNfaSpan all = _ReadRepeated();
        while (_BeginsItem()) {
            const CNfaSpan next = _ReadRepeated();
            _fAutomaton->AddEmptyArc(all.end, next.start);
            all.end = next.end;
        }
        return all;
    }

    bool _BeginsItem() const {
        const CPiece& piece = _Current();
        return piece.kind == EPiece::kName || piece.kind == EPiece::kQuoted || piece.IsMark('(') ||
               piece.IsMark('[');
    }

    CNfaSpan _ReadRepeated() {
        const CNfaSpan item = _ReadItem();
        const bool is_star = _Current().IsMark('*');
        if (!is_star && !_Current().IsMark('+')) return item;
        _fPieces.Advance();
        const CNfaSpan repeated = _NewSpan();
        _fAutomaton->AddEmptyArc(repeated.start, item.start);
        _fAutomaton->AddEmptyArc(item.end, item.start);
        _fAutomaton->AddEmptyArc(item.end, repeated.end);
        if (is_star) _fAutomaton->AddEmptyArc(repeated.start, repeated.end);
        return repeated;
    }

    CNfaSpan _ReadItem() {
        if (!_BeginsItem()) _fPieces.RaiseExpected("a name, a quoted text, '(' or '['");
        if (_Current().kind != EPiece::kMark) return _ReadSymbol();
        const bool is_optional = _Current().IsMark('[');
        _fPieces.Advance();
        const CNfaSpan inner = _ReadAlternatives();
        if (is_optional) {
            _TakeMark(']', "']'");
            _fAutomaton->AddEmptyArc(inner.start, inner.end);
        } else {
            _TakeMark(')', "')'");
        }
        return inner;
    }

    CNfaSpan _ReadSymbol() {
        const CNfaSpan span = _NewSpan();
        _fAutomaton->AddArc(span.start, _NumberOf(_Current()), span.end);
        _fPieces.Advance();
        return span;
    }

    int _NumberOf(const CPiece& piece) {
        const bool is_quoted = piece.kind == EPiece::kQuoted;
        const std::pair key(is_quoted, std::string(piece.text));
        const auto [found, is_new] = _fNumbers.try_emplace(key, static_cast<int>(_fResult.symbols.size()));
        if (is_new) _fResult.symbols.push_back({key.second, is_quoted, piece.row});
        return found->second;
    }

    CPieceReader _fPieces;
    CGrammarText _fResult;
    CNfa* _fAutomaton = nullptr;  // of the rule that is being read
    std::map<std::pair<bool, std::string>, int> _fNumbers;
};

}  // namespace

CGrammarText ReadGrammarText(const std::string& file_name, std::string_view text) {
    return CRulesReader(file_name, text).Read();
}

}  // namespace codeloom
