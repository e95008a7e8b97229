#include "tokenizer/annotations.h"

#include <string_view>

#include "text/token_type.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

enum class EFrameKind {
    kHeader,      // outside brackets, from the keyword to the ":" of the header
    kStatement,   // outside brackets, `target: hint = value`
    kParameters,  // in the brackets after a def's name: `name: hint = value, ...`
    kFirstIsHint,
    kAllAlike,  // hints all the same, or none at all
};

// What the scanner knows within one pair of brackets, or outside all.
struct CFrame {
    EFrameKind kind;
    bool is_hint = false;  // a string here is a hint
    int open_lambdas = 0;  // whose ":" is still to come
};

// Goes through the tokens of one logical line, outermost brackets first.
class CAnnotationScanner {
  public:
    CAnnotationScanner(const CRawLogical& logical, std::vector<size_t>& hints)
        : _fText(logical.file_text), _fTokens(logical.tokens), _fHints(hints) {}

    void Scan(const CFrame& outermost, bool takes_parameters);

  private:
    bool _VisitToken(size_t token_i);
    bool _VisitColon();
    bool _VisitEqual();
    void _VisitComma();
    CFrame _FrameInBracket(const CRawToken& opener) const;
    bool _IsWholeHint(size_t token_i) const;
    bool _IsAfterOperand() const;
    std::string_view _PreviousText() const;
    int16_t _NextType(size_t token_i) const;

    CFrame& _Frame() { return _fFrames.back(); }

    std::string_view _fText;
    const std::vector<CRawToken>& _fTokens;
    std::vector<size_t>& _fHints;
    std::vector<CFrame> _fFrames;
    const CRawToken* _fPrevious = nullptr;
    bool _fTakesParameters = false;  // parentheses in the header hold parameters
};

void CAnnotationScanner::Scan(const CFrame& outermost, bool takes_parameters) {
    _fFrames.push_back(outermost);
    _fTakesParameters = takes_parameters;
    for (size_t token_i = 0; token_i < _fTokens.size(); ++token_i) {
        if (IsPassedOver(_fTokens[token_i])) continue;
        if (!_VisitToken(token_i)) return;
        _fPrevious = &_fTokens[token_i];
    }
}

// False when no hint can follow.
bool CAnnotationScanner::_VisitToken(size_t token_i) {
    const CRawToken& token = _fTokens[token_i];
    switch (token.type) {
        case kTokenId_NAME:
            _Frame().open_lambdas += token.word == EWord::kLambda;
            return true;
        case kTokenId_STRING:
            if (_Frame().is_hint && _IsWholeHint(token_i)) _fHints.push_back(token_i);
            return true;
        case kTokenId_LPAR:
        case kTokenId_LSQB:
        case kTokenId_LBRACE:
            _fFrames.push_back(_FrameInBracket(token));
            return true;
        case kTokenId_RPAR:
        case kTokenId_RSQB:
        case kTokenId_RBRACE:
            if (_fFrames.size() > 1) _fFrames.pop_back();
            return true;
        case kTokenId_COLON:
            return _VisitColon();
        case kTokenId_EQUAL:
            return _VisitEqual();
        case kTokenId_COMMA:
            _VisitComma();
            return true;
        case kTokenId_RARROW:
            _Frame().is_hint |= _Frame().kind == EFrameKind::kHeader && token.word == EWord::kArrow;
            return true;
        default:
            return true;
    }
}

bool CAnnotationScanner::_VisitColon() {
    CFrame& frame = _Frame();
    if (frame.open_lambdas > 0) {
        --frame.open_lambdas;
        return true;
    }
    if (frame.kind == EFrameKind::kParameters || frame.kind == EFrameKind::kStatement) frame.is_hint = true;
    return frame.kind != EFrameKind::kHeader;
}

bool CAnnotationScanner::_VisitEqual() {
    if (_Frame().kind == EFrameKind::kParameters) _Frame().is_hint = false;
    return _Frame().kind != EFrameKind::kStatement;
}

void CAnnotationScanner::_VisitComma() {
    CFrame& frame = _Frame();
    if (frame.open_lambdas > 0) return;
    if (frame.kind == EFrameKind::kParameters || frame.kind == EFrameKind::kFirstIsHint)
        frame.is_hint = false;
}

CFrame CAnnotationScanner::_FrameInBracket(const CRawToken& opener) const {
    const CFrame& outer = _fFrames.back();
    if (!outer.is_hint) {
        const bool holds_parameters = opener.type == kTokenId_LSQB || _fTakesParameters;
        const bool in_header = outer.kind == EFrameKind::kHeader && holds_parameters;
        return {in_header ? EFrameKind::kParameters : EFrameKind::kAllAlike};
    }
    if (opener.type == kTokenId_LBRACE) return {EFrameKind::kAllAlike};
    if (!_IsAfterOperand()) return {EFrameKind::kAllAlike, true};
    if (opener.type == kTokenId_LPAR || _PreviousText() == "Literal") return {EFrameKind::kAllAlike};
    return {_PreviousText() == "Annotated" ? EFrameKind::kFirstIsHint : EFrameKind::kAllAlike, true};
}

// The string is a plain one, without escapes, and no part of a longer expression than a union.
bool CAnnotationScanner::_IsWholeHint(size_t token_i) const {
    const std::string_view text = TextOf(_fTokens[token_i], _fText);
    const CStringStart start = ReadStringStart(text, 0);
    if (start.is_bytes || start.has_fields || text.find('\\') != std::string_view::npos) return false;
    switch (_fPrevious ? _fPrevious->type : kTokenId_ENDMARKER) {
        case kTokenId_ENDMARKER:
        case kTokenId_COLON:
        case kTokenId_RARROW:
        case kTokenId_LSQB:
        case kTokenId_LPAR:
        case kTokenId_COMMA:
        case kTokenId_VBAR:
        case kTokenId_STAR:
            break;
        default:
            return false;
    }
    switch (_NextType(token_i)) {
        case kTokenId_ENDMARKER:
        case kTokenId_COLON:
        case kTokenId_RSQB:
        case kTokenId_RPAR:
        case kTokenId_COMMA:
        case kTokenId_VBAR:
        case kTokenId_EQUAL:
            return true;
        default:
            return false;
    }
}

bool CAnnotationScanner::_IsAfterOperand() const {
    if (!_fPrevious) return false;
    const int16_t type = _fPrevious->type;
    return type == kTokenId_NAME || type == kTokenId_RSQB || type == kTokenId_RPAR || type == kTokenId_STRING;
}

std::string_view CAnnotationScanner::_PreviousText() const {
    return _fPrevious ? TextOf(*_fPrevious, _fText) : std::string_view();
}

int16_t CAnnotationScanner::_NextType(size_t token_i) const {
    for (++token_i; token_i < _fTokens.size(); ++token_i) {
        if (!IsPassedOver(_fTokens[token_i])) return _fTokens[token_i].type;
    }
    return kTokenId_ENDMARKER;
}

}  // namespace

void FindHintStrings(const CRawLogical& logical, std::vector<size_t>& hints) {
    CAnnotationScanner scanner(logical, hints);
    switch (logical.type) {
        case ELogicalType::kFunctionDef:
            scanner.Scan({EFrameKind::kHeader}, true);
            break;
        case ELogicalType::kClassDef:
        case ELogicalType::kTypeStatement:
            scanner.Scan({EFrameKind::kHeader}, false);
            break;
        case ELogicalType::kAssignment:
            scanner.Scan({EFrameKind::kStatement}, false);
            break;
        default:
            break;
    }
}

void FindNestedHintStrings(const CRawLogical& hint, std::vector<size_t>& hints) {
    CAnnotationScanner(hint, hints).Scan({EFrameKind::kAllAlike, true}, false);
}

}  // namespace codeloom
