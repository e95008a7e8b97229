#include "tokenizer/scopes.h"

#include "tokenizer/raw_logical.h"

namespace codeloom {

namespace {

bool IsAsyncHeader(const CRawLogical& logical) {
    for (const CRawToken& token : logical.tokens) {
        if (token.word == EWord::kAsync) return true;
        if (token.word == EWord::kDef) return false;
    }
    return false;
}

}  // namespace

void CScopes::Visit(CRawLogical& logical, int32_t indent, bool is_mid_row) {
    logical.first_in_def = !is_mid_row && indent > _fAwaitingDef;
    logical.is_method = false;
    if (logical.type == ELogicalType::kComment) {
        logical.in_async_def = _IsInAsync(indent);
        return;
    }
    _fAwaitingDef = kNoDef;
    if (!is_mid_row) {
        while (!_fScopes.empty() && _fScopes.back().indent >= indent) _fScopes.pop_back();
    }
    logical.in_async_def = !_fScopes.empty() && _fScopes.back().is_async;
    if (logical.type == ELogicalType::kFunctionDef) {
        const bool is_async = IsAsyncHeader(logical);
        logical.in_async_def |= is_async;
        logical.is_method = !_fScopes.empty() && _fScopes.back().is_class;
        _fScopes.push_back({indent, is_async, false});
        _fAwaitingDef = indent;
    } else if (logical.type == ELogicalType::kClassDef) {
        _fScopes.push_back({indent, false, true});
    }
}

// The row itself may have opened a scope.
bool CScopes::IsInClassOnly(int32_t indent) const {
    return !_fScopes.empty() && _fScopes[0].is_class && _fScopes[0].indent == 0 &&
           (_fScopes.size() == 1 || _fScopes[1].indent >= indent);
}

// A comment ends no scope, since its indentation is free.
bool CScopes::_IsInAsync(int32_t indent) const {
    for (auto scope = _fScopes.rbegin(); scope != _fScopes.rend(); ++scope) {
        if (scope->indent < indent) return scope->is_async;
    }
    return false;
}

}  // namespace codeloom
