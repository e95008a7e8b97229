#include "typing/hint_parser.h"

#include <algorithm>

#include "syntax/nodes.h"
#include "tokenizer/tokenizer.h"
#include "typing/function_hint.h"

namespace codeloom {

namespace {

// A hint is an expression. What stands for a statement is none: its node, or the leaf of a keyword such as
// `pass`.
bool IsHintExpression(const CTreeNode& node) {
    if (node.Is(ENodeKind::kKeywordLiteral)) return IsValueWord(node.word);
    return (node.Is(ENodeKind::kExpression) || node.IsLeaf()) && !node.Is(ENodeKind::kYield);
}

// What a fault is reported at: invented tokens after the last one stand for that.
size_t LastUpTo(uint32_t token_i, size_t token_count) {
    return std::min<size_t>(token_i, token_count - 1);
}

}  // namespace

CHintTree CHintParser::ParseExpression(const CCommentHint& hint) {
    _fText = hint.text;
    CTokenizer tokenizer(_fText);
    if (!tokenizer.NextLogical(_fLine) || tokenizer.NextLogical(_fRest)) return {};
    if (const CFault fault = _fParser.Parse(_fLine, false, _fTree))
        throw CHintRefusal{_fLine.tokens[LastUpTo(fault.token_i, _fLine.tokens.size())].start};
    if (_fTree.fIsEmpty || !IsHintExpression(_fTree.fRoot)) return {};
    return {&_fTree, hint.start};
}

CHintTree CHintParser::ParseFunction(const CCommentHint& hint) {
    CDefForHint def = DefForHint(hint.text);
    _fText = std::move(def.text);
    _fLine = CRawLogical();
    _fLine.file_text = _fText;
    _fLine.type = ELogicalType::kFunctionDef;
    for (const CDefForHint::CToken& token : def.tokens)
        _fLine.tokens.push_back(MakeToken(_fLine.file_text.substr(token.start, token.length), token.start));
    if (const CFault fault = _fParser.ParseTokens(_fLine, false, _fTree)) {
        const size_t token_i = LastUpTo(fault.token_i, def.tokens.size());
        throw CHintRefusal{static_cast<uint32_t>(def.tokens[token_i].offset)};
    }
    if (_fTree.fIsEmpty || !_fTree.fRoot.Is(ENodeKind::kFuncdef)) return {};
    return {&_fTree, hint.start - static_cast<uint32_t>(CDefForHint::kHead.size())};
}

}  // namespace codeloom
