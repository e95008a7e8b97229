#include "parse/token_feed.h"

#include "host/text.h"
#include "parse/syntax_error.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

// Of a name where `async` and `await` are keywords.
int AsyncTokenType(std::string_view text) {
    if (text.size() != 5 || text.front() != 'a') return kTokenId_NAME;
    if (text == "async") return kTokenId_ASYNC;
    return text == "await" ? kTokenId_AWAIT : kTokenId_NAME;
}

}  // namespace

CTokenFeed::CTokenFeed(CPGenParserImpl& driver, const nb::tuple& toks, bool in_async_def,
                       const CPositions& positions, Py_ssize_t start, Py_ssize_t end)
    : _fDriver(driver),
      _fParser(*driver._fParser),
      _fToks(toks),
      _fPositions(positions),
      _fRawTokens(positions.TokensOf(toks)),
      _fStart(start),
      _fEnd(end),
      _fAsyncIsKeyword(driver._fAsyncAlwaysKeyword || in_async_def) {
    _fParser.setup(nb::int_(driver._fFileInputNumber));
}

void CTokenFeed::FeedAll() {
    for (Py_ssize_t i = _fStart; i < _fEnd; ++i) _FeedToken(i);
    _CompleteStatement();
    static const CHostText kNewline("\n");
    const nb::int_ end(_fEnd);  // the context of the invented tail: after the last real token
    _fParser.addtoken(kTokenId_NEWLINE, kNewline, end);
    _fParser.addtoken(kTokenId_ENDMARKER, nb::none(), end);
}

void CTokenFeed::_FeedToken(Py_ssize_t i) {
    nb::handle tok = TupleItem(_fToks, i);
    if (tok.is_none()) return;
    const CUtf8 text(tok);
    int type = _fRawTokens != nullptr ? _fRawTokens[i].type : GetTokenType(text);
    if (!_fFirstToken.is_valid()) type = _BeginStatement(tok, text, type, i);
    if (type == kTokenId_NAME && _fAsyncIsKeyword) type = AsyncTokenType(text);
    if (_IsSkipped(type, i)) return;
    if (type == kTokenId_ELLIPSIS && !_fDriver._fPy3Grammar) return _FeedThreeDots(tok, i);
    _fParser.addtoken(type, tok, nb::int_(i));
    _fLastFedType = type;
    if (!_fFirstToken.is_valid()) _fFirstToken = nb::borrow(tok);
}

// Treats a token that may begin the statement; gives its type. `elif` is read as `if` from here on.
int CTokenFeed::_BeginStatement(nb::handle& tok, std::string_view text, int type, Py_ssize_t i) {
    if (type == kTokenId_AT) _fIsDecorator = true;
    if (type != kTokenId_NAME) return type;
    static const CHostText kIf("if");
    if (text == "elif") {
        tok = kIf;
    } else if (text == "except" || text == "finally") {
        _FeedInventedHead({"try", ":", "pass", "\n"}, i);
    } else if (text == "else") {
        _FeedInventedHead({"if", "0", ":", "pass", "\n"}, i);
    } else if (text == "async" && !_fAsyncIsKeyword) {
        const nb::object next = NextNonRemovedTokenInTuple(_fToks, i);
        if (!next.is_none() && CUtf8(next) == "def") return kTokenId_ASYNC;
    }
    return type;
}

bool CTokenFeed::_IsSkipped(int type, Py_ssize_t i) {
    if (type == kTokenId_COMMENT) return true;
    if (type != kTokenId_BACKSLASH) return false;
    const bool ends_part = i + 1 == _fEnd && _fEnd < TupleSize(_fToks);
    return ends_part || _fDriver._ShouldSkipSlash(i, _fPositions);
}

// The 2.7 grammar knows an ellipsis as three dots.
void CTokenFeed::_FeedThreeDots(nb::handle tok, Py_ssize_t i) {
    nb::list dots;
    for (int dot_i = 0; dot_i < 3; ++dot_i) dots.append(".");
    _fDriver._AddTokenList(dots, i);
    if (!_fFirstToken.is_valid()) _fFirstToken = nb::borrow(tok);
}

void CTokenFeed::_CompleteStatement() {
    const bool lacks_body = _fLastFedType == kTokenId_COLON;
    if (_fFirstToken.is_valid() && CUtf8(_fFirstToken) == "try") {
        if (lacks_body) {
            _FeedInventedTail({"pass", "\n", "finally", ":", "pass"});
        } else {
            _FeedInventedTail({"\n", "finally", ":", "pass"});
        }
    } else if (_fIsDecorator) {
        _FeedInventedTail({"\n", "def", "function", "(", ")", ":", "pass"});
    } else if (lacks_body) {
        static const CHostText kPass("pass");
        _fParser.addtoken(kTokenId_NAME, kPass, nb::int_(_fEnd));
    }
}

void CTokenFeed::_FeedInventedHead(std::initializer_list<const char*> texts, Py_ssize_t i) {
    for (const char* text : texts) _fParser.addtoken(GetTokenType(text), InternedText(text), nb::int_(i));
}

void CTokenFeed::_FeedInventedTail(std::initializer_list<const char*> texts) {
    nb::list invented;
    for (const char* text : texts) invented.append(InternedText(text));
    _fDriver._AddTokenList(invented, _fEnd);
}

}  // namespace codeloom
