#include "hints/hint_text.h"

#include <string>
#include <utility>

#include "host/collections.h"
#include "host/text.h"
#include "neighbours/fastaccess/string_tokens.h"

namespace codeloom {

namespace {

constexpr std::string_view kTypeMark = "type:";
constexpr std::string_view kDefPrefix = "def function ";
constexpr const char* kDummyName = "a";
constexpr Py_ssize_t kTokensBeforeEllipsis = 3;  // def function (

// `text` stripped as the host does it.
nb::object Stripped(std::string_view text, const char* method = "strip") {
    return TextFromUtf8(text).attr(method)();
}

bool IsHintMark(std::string_view before) {
    return nb::cast<bool>(nb::object(Stripped(before).attr("endswith")("#")));
}

// Collects the tokens of the `def`, one by one.
class CDefRewriter {
  public:
    void Add(std::string_view tok, size_t open_count, Py_ssize_t offset) {
        // A token that stands directly among the parameters may begin one.
        const bool is_direct = _fNesting == 1 && open_count == 1 && tok != "]" && tok != "}";
        ++_fTokCount;
        const std::string last_tok = std::exchange(_fLastTok, std::string(tok));
        if (tok == "(") {
            ++_fNesting;
        } else if (tok == ")") {
            --_fNesting;
        } else if (is_direct) {
            const bool is_first = last_tok == "(";
            if (tok == "..." && is_first && _fTokCount == kTokensBeforeEllipsis + 1) return;
            if (is_first || last_tok == ",") _AppendDummy(offset);
        }
        _Append(InternedText(tok), offset);
    }

    CRewrittenHint Rewritten() const { return {_fToks, _fOffsets}; }

  private:
    void _Append(const nb::object& tok, Py_ssize_t offset) {
        _fToks.append(tok);
        _fOffsets.append(offset);
    }

    void _AppendDummy(Py_ssize_t offset) {
        _Append(InternedText(kDummyName), offset);
        _Append(InternedText(":"), offset);
    }

    nb::list _fToks, _fOffsets;
    std::string _fLastTok;
    Py_ssize_t _fTokCount = 0;
    Py_ssize_t _fNesting = 0;
};

}  // namespace

bool HoldsTypeMark(nb::handle comment) {
    return IsText(comment) && CUtf8(comment)->find(kTypeMark) != std::string_view::npos;
}

CTextOrNone HintInComment(const nb::str& comment) {
    const CUtf8 utf8(comment);
    const std::string_view text = utf8;
    const size_t pos = text.find(kTypeMark);
    if (pos == std::string_view::npos || !IsHintMark(text.substr(0, pos))) return CTextOrNone();
    const size_t start = pos + kTypeMark.size();
    const std::string_view rest = text.substr(start, text.substr(start).find('#'));
    if (Stripped(rest).equal(nb::str("ignore"))) return CTextOrNone();
    return CTextOrNone(Stripped(std::string(start, ' ').append(rest), "rstrip"));
}

bool HasFunctionForm(const nb::str& hint) {
    const CUtf8 utf8(hint);
    return CStringTokens(utf8).Token() == "(";
}

CRewrittenHint RewriteFunctionHint(const nb::str& hint) {
    const CUtf8 utf8(hint);
    const std::string text = std::string(kDefPrefix).append(utf8) + ":";
    CDefRewriter rewriter;
    for (CStringTokens toks(text); !toks.IsAtEnd(); toks.Next())
        rewriter.Add(toks.Token(), toks.NestCount(),
                     static_cast<Py_ssize_t>(toks.Pos()) - static_cast<Py_ssize_t>(kDefPrefix.size()));
    return rewriter.Rewritten();
}

}  // namespace codeloom
