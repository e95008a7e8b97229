#include "neighbours/tokenizer/field_recorder.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/logical_type.h"

namespace codeloom {

namespace {

// The tokens can be an expression, as far as their first one and the signs outside brackets tell; the grammar
// would take statements too.
bool CanBeExpression(const std::vector<CRawToken>& tokens) {
    const CRawToken* first = FindFirstSignificant(tokens);
    if (!first || first->type == kTokenId_AT || first->text == "from") return false;
    if (first->type == kTokenId_NAME && StartsStatement(first->text, 0)) return false;
    int depth = 0;
    for (const CRawToken& token : tokens) {
        const EByteKind kind = ByteKind(token.text[0]);
        depth += kind == EByteKind::kOpener;
        depth -= kind == EByteKind::kCloser;
        if (depth == 0 && (token.type == kTokenId_SEMI || IsAssignmentOperator(token))) return false;
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

void CFieldRecorder::AddFieldToken(size_t pos, size_t end, int16_t type) {
    _InnermostTokens().push_back({_fText.substr(pos, end - pos), {}, type});
}

void CFieldRecorder::EndExpression(size_t pos, bool is_sound) {
    std::vector<CRawToken>& tokens = _InnermostTokens();
    if (!is_sound || !CanBeExpression(tokens)) tokens.push_back(_SignAt(pos));
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
    const std::string_view sign = _fText.substr(pos, 1);
    return {sign, {}, static_cast<int16_t>(GetTokenType(sign))};
}

}  // namespace codeloom
