#include "signatures/signature_finder.h"

#include <algorithm>

#include "syntax/definitions.h"

namespace codeloom {

namespace {

constexpr int kMostDepth = 100;  // of tuples among the parameters of Python 2

CSpan SpanOrNone(const CTree& tree, const CTreeNode* node) {
    return node == nullptr ? CSpan() : SpanOf(tree, *node);
}

EParameterKind KindOf(const CParameter& parameter, bool is_after_star) {
    if (parameter.stars == EStars::kTwo) return EParameterKind::kVarKeyword;
    if (parameter.stars == EStars::kOne) return EParameterKind::kVarPositional;
    return is_after_star ? EParameterKind::kKeywordOnly : EParameterKind::kPositionalOrKeyword;
}

bool HoldsDot(std::string_view text) {
    return text.find('.') != std::string_view::npos;
}

}  // namespace

// Lines

void CSignatureFinder::BeginLine(const CRawLogical& line, uint32_t line_i) {
    _fLine = &line;
    _fLine_i = line_i;
    _fFirstSignature = _fFound.items.size();
    _fFirstParameter = _fFound.parameters.size();
    _fFirstHint = _fFound.hints.size();
    _fIndexedHints.clear();
}

void CSignatureFinder::EndLine(bool has_fault) {
    if (!has_fault) return _PlaceIndexedHints();
    _fFound.items.CutTo(_fFirstSignature);
    _fFound.parameters.CutTo(_fFirstParameter);
    _fFound.hints.CutTo(_fFirstHint);
}

// Functions

// `def`, `async def`, and either with type parameters
void CSignatureFinder::Take(const CTree& tree) {
    if (!tree.HasKind(ENodeKind::kFuncdef)) return;
    const CTreeNode* node = &tree.fRoot;
    bool is_async = false;
    while (!node->IsLeaf() && !node->Is(ENodeKind::kFuncdef)) {
        is_async |= HasWordAt(tree, *node, 0, EWord::kAsync);
        if (!node->Is(ENodeKind::kWithTypeParameters) && !is_async) return;
        node = &LastChild(tree, *node);
    }
    if (!node->IsLeaf()) _AddFuncdef(tree, *node, is_async);
}

void CSignatureFinder::_AddFuncdef(const CTree& tree, const CTreeNode& funcdef, bool is_async) {
    CSignature signature;
    signature.name = SpanOf(tree, NameOfFuncdef(tree, funcdef));
    signature.line = _fLine_i;
    signature.first_parameter = static_cast<uint32_t>(_fFound.parameters.size());
    signature.is_async = is_async || _fLine->tokens.front().word == EWord::kAsync;
    signature.is_method = _fLine->is_method;
    _fFound.items.push_back(signature);
    _fIsAfterStar = false;
    _AddParameters(tree, ParametersOfFuncdef(tree, funcdef), 0);
    _MarkPositionalOnly(tree, ParametersOfFuncdef(tree, funcdef));
}

void CSignatureFinder::_AddParameters(const CTree& tree, const CTreeNode& parameters, int depth) {
    if (depth > kMostDepth) return;
    ForEachParameter(tree, parameters, [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) return _AddParameters(tree, *parameter.nested, depth + 1);
        if (parameter.name != nullptr)
            _fFound.parameters.push_back({SpanOf(tree, *parameter.name), SpanOrNone(tree, parameter.value),
                                          kNone, KindOf(parameter, _fIsAfterStar)});
        _fIsAfterStar |= parameter.stars == EStars::kOne;
    });
}

// Those before a `/`.
void CSignatureFinder::_MarkPositionalOnly(const CTree& tree, const CTreeNode& parameters) {
    const CTreeNode* const list = TryChild(tree, parameters, 1, ENodeKind::kDefiningArglist);
    if (list == nullptr) return;
    for (const CTreeNode& child : tree.Children(*list)) {
        if (!IsToken(child, kTokenId_SLASH)) continue;
        const uint32_t slash = SpanOfLeaf(tree, child).start;
        for (size_t i = _fFirstParameter; i < _fFound.parameters.size(); ++i)
            if (_fFound.parameters[i].name.start < slash)
                _fFound.parameters[i].kind = EParameterKind::kPositionalOnly;
    }
}

// Hints

void CSignatureFinder::TakeHintOf(const CHintNote& note) {
    if (note.of_function) return _AddHintOfFunction(note);
    const std::string_view target =
        _fLine->file_text.substr(note.name.start, note.name.end - note.name.start);
    const EHintKind kind = HoldsDot(target) ? EHintKind::kAttribute : EHintKind::kVariable;
    _fFound.hints.push_back({note.hint, note.name, _fLine_i, kind, note.in_comment});
}

// Of a parameter by its place or its index, or of what the function gives back.
void CSignatureFinder::_AddHintOfFunction(const CHintNote& note) {
    // That of a comment is about the function on the line before.
    if (_fFound.items.empty() || _fFound.items.back().line + 1 < _fLine_i) return;
    const auto hint_i = static_cast<uint32_t>(_fFound.hints.size());
    CSignature& signature = _fFound.items.back();
    const EHintKind kind = note.is_return ? EHintKind::kReturn : EHintKind::kParameter;
    _fFound.hints.push_back(
        {note.hint, note.is_return ? signature.name : note.name, _fLine_i, kind, note.in_comment});
    if (note.is_return) {
        signature.return_hint = std::min(signature.return_hint, hint_i);
    } else if (note.argument_i >= 0) {
        _fIndexedHints.push_back(hint_i);
    } else {
        for (size_t i = signature.first_parameter; i < _fFound.parameters.size(); ++i)
            if (_fFound.parameters[i].name.start == note.name.start) _fFound.parameters[i].hint = hint_i;
    }
}

// There must be as many hints as parameters; those of a method may leave out the first.
void CSignatureFinder::_PlaceIndexedHints() {
    if (_fIndexedHints.empty() || _fFound.items.empty()) return;
    const CSignature& signature = _fFound.items.back();
    size_t parameter_i = signature.first_parameter;
    const size_t count = _fFound.parameters.size() - parameter_i;
    if (signature.is_method && _fIndexedHints.size() + 1 == count) ++parameter_i;
    if (_fIndexedHints.size() != _fFound.parameters.size() - parameter_i) return;
    for (const uint32_t hint_i : _fIndexedHints) {
        CSignatureParameter& parameter = _fFound.parameters[parameter_i++];
        _fFound.hints[hint_i].target = parameter.name;
        if (parameter.hint == kNone) parameter.hint = hint_i;
    }
}

}  // namespace codeloom
