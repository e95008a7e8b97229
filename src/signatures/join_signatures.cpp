#include "signatures/join_signatures.h"

#include "text/move_bytes.h"

namespace codeloom {

void CSignatureJoiner::Append(const CSignatures& part, uint32_t shift, uint32_t first_line) {
    const auto first_parameter = static_cast<uint32_t>(_fJoined.parameters.size());
    const auto first_hint = static_cast<uint32_t>(_fJoined.hints.size());
    const auto moved_hint = [first_hint](uint32_t hint) {
        return hint == UINT32_MAX ? hint : hint + first_hint;
    };
    for (CSignature signature : part.items) {
        MoveBytesIfAny(signature.name, shift);
        signature.line += first_line;
        signature.first_parameter += first_parameter;
        signature.return_hint = moved_hint(signature.return_hint);
        _fJoined.items.push_back(signature);
    }
    for (CSignatureParameter parameter : part.parameters) {
        MoveBytesIfAny(parameter.name, shift);
        MoveBytesIfAny(parameter.default_value, shift);
        parameter.hint = moved_hint(parameter.hint);
        _fJoined.parameters.push_back(parameter);
    }
    for (CHintInfo hint : part.hints) {
        MoveBytesIfAny(hint.hint, shift);
        MoveBytesIfAny(hint.target, shift);
        hint.line += first_line;
        _fJoined.hints.push_back(hint);
    }
}

}  // namespace codeloom
