#include "causes/line_probe.h"

#include <cassert>

namespace codeloom {

int CLineProbe::FaultWith(const CRawLogical& line, bool in_async_def, const CEdit& edit) {
    const std::vector<CRawToken>& tokens = line.tokens;
    assert(edit.at >= 0 && edit.at <= static_cast<int>(tokens.size()));
    _fEdited.file_text = line.file_text;
    _fEdited.type = line.type;
    const auto begin = tokens.begin() + edit.at;
    const auto rest = tokens.end() - begin > edit.removed ? begin + edit.removed : tokens.end();
    _fEdited.tokens.assign(tokens.begin(), begin);
    // It has the place of the token that follows, and the text of the first one, which isn't a bracket.
    CRawToken invented = begin != tokens.end() ? *begin : tokens.back();
    invented.start = tokens.front().start;
    invented.length = tokens.front().length;
    for (const CInventedToken& token : edit.inserted) {
        invented.type = token.type;
        invented.word = token.word;
        _fEdited.tokens.push_back(invented);
    }
    _fEdited.tokens.insert(_fEdited.tokens.end(), rest, tokens.end());
    const CFault fault = _fParser.Parse(_fEdited, in_async_def, _fTree);
    return fault.kind == EFault::kInvalidSyntax ? static_cast<int>(fault.token_i) : kSound;
}

}  // namespace codeloom
