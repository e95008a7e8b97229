#include "tokenizer/field_recorder.h"

#include "text/token_type.h"
#include "tokenizer/keywords.h"
#include "tokenizer/lexer.h"
#include "tokenizer/logical_type.h"
#include "tokenizer/operators.h"

namespace codeloom {

namespace {

// The tokens can be an expression, as far as their first one and the signs outside brackets show; the grammar
// would take statements too.
bool CanBeExpression(const std::vector<CRawToken>& tokens, std::string_view text) {
    const CRawToken* first = FindFirstSignificant(tokens);
    if (!first || first->type == kTokenId_AT || first->word == EWord::kFrom) return false;
    if (first->type == kTokenId_NAME && StartsStatement(TextOf(*first, text), 0)) return false;
    int depth = 0;
    for (const CRawToken& token : tokens) {
        const EByteKind kind = ByteKind(text[token.start]);
        depth += kind == EByteKind::kOpener;
        depth -= kind == EByteKind::kCloser;
        if (depth == 0 && (token.type == kTokenId_SEMI || IsAssignmentOperator(token.type, token.word)))
            return false;
    }
    return true;
}

}  // namespace

void CFieldRecorder::GiveUp() {
    for (const COpenField& field : _fOpen) {
        std::vector<CRawToken>& tokens = _fLogicals[field.logical_i].tokens;
        tokens.insert(tokens.begin(), _SignAt(field.brace_pos));
    }
    _fOpen.clear();
}

void CFieldRecorder::BeginField(size_t brace_pos) {
    _Add();
    _fOpen.push_back({_fLogicals.size() - 1, brace_pos});
}

void CFieldRecorder::AddFieldToken(size_t pos, const CLexedToken& token) {
    _InnermostTokens().push_back(MakeToken(pos, token));
}

void CFieldRecorder::EndExpression(size_t pos, bool is_sound) {
    std::vector<CRawToken>& tokens = _InnermostTokens();
    if (!is_sound || !CanBeExpression(tokens, _fText)) tokens.push_back(_SignAt(pos));
}

void CFieldRecorder::AddLoneBrace(size_t pos) {
    _Add().tokens.push_back(_SignAt(pos));
}

CRawLogical& CFieldRecorder::_Add() {
    CRawLogical& logical = _fSpare.AddTo(_fLogicals);
    logical.type = ELogicalType::kFstringFieldExp;
    return logical;
}

CRawToken CFieldRecorder::_SignAt(size_t pos) const {
    const COperator sign = OperatorAt(_fText.substr(pos, 1), 0);
    return {static_cast<uint32_t>(pos), 1, {}, sign.type, sign.word};
}

}  // namespace codeloom
