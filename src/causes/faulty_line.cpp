#include "causes/faulty_line.h"

#include <algorithm>
#include <vector>

namespace codeloom {

namespace {

constexpr CRawToken kEndMarker{};
static_assert(kEndMarker.type == kTokenId_ENDMARKER);

// Words that are values, although they are keywords.
bool IsValue(EWord word) {
    return word == EWord::kNoneValue || word == EWord::kTrue || word == EWord::kFalse;
}

bool BeginsExpression(EWord word) {
    return IsValue(word) || word == EWord::kNot || word == EWord::kLambda || word == EWord::kAwait;
}

bool Matches(const CRawToken& token, CInventedToken wanted) {
    return wanted.word == EWord::kNone ? token.type == wanted.type : token.word == wanted.word;
}

}  // namespace

CFaultyLine::CFaultyLine(const CRawLogical& line, const CRawLogical& part, uint32_t token_i,
                         const CLanguage& language, CLineProbe& probe)
    : _fOuter(line), _fLanguage(language), _fProbe(probe) {
    _fPart.file_text = part.file_text;
    _fPart.type = part.type;
    for (uint32_t i = 0; i < part.tokens.size(); ++i) {
        if (i == token_i) _fAt = Count();
        if (i == token_i || !IsPassedOver(part.tokens[i])) _fPart.tokens.push_back(part.tokens[i]);
    }
    if (token_i >= part.tokens.size()) _fAt = Count();
    if (_fPart.tokens.empty()) _fPart.tokens = part.tokens;
}

const CRawToken& CFaultyLine::Token(int i) const {
    return i >= 0 && i < Count() ? _fPart.tokens[static_cast<size_t>(i)] : kEndMarker;
}

bool CFaultyLine::IsKeyword(int i) const {
    return Word(i) != EWord::kNone && Is(i, kTokenId_NAME) && _fLanguage.IsKeyword(Word(i));
}

bool CFaultyLine::IsAdjacent(int i) const {
    return i > 0 && i < Count() && Token(i - 1).start + Token(i - 1).length == Token(i).start;
}

bool CFaultyLine::IsOnNextRow(int i) const {
    return i > 0 && i < Count() && Token(i - 1).position.row < Token(i).position.row;
}

bool CFaultyLine::EndsOperand(int i) const {
    switch (Type(i)) {
        case kTokenId_NAME:
            return !IsKeyword(i) || IsValue(Word(i));
        case kTokenId_NUMBER:
        case kTokenId_STRING:
        case kTokenId_ELLIPSIS:
            return true;
        default:
            return IsCloserType(Type(i));
    }
}

bool CFaultyLine::BeginsOperand(int i) const {
    switch (Type(i)) {
        case kTokenId_NAME:
            return !IsKeyword(i) || BeginsExpression(Word(i));
        case kTokenId_NUMBER:
        case kTokenId_STRING:
        case kTokenId_ELLIPSIS:
        case kTokenId_TILDE:
            return true;
        default:
            return IsOpenerType(Type(i));
    }
}

int CFaultyLine::OpenerBefore(int i) const {
    int closed = 0;
    while (--i >= 0) {
        if (IsCloserType(Type(i))) ++closed;
        if (IsOpenerType(Type(i)) && --closed < 0) return i;
    }
    return -1;
}

int CFaultyLine::CloserOf(int opener_i) const {
    int open = 0;
    for (int i = opener_i; i < Count(); ++i) {
        open += IsOpenerType(Type(i)) - IsCloserType(Type(i));
        if (open == 0) return i;
    }
    return Count();
}

int CFaultyLine::OperandStart(int last_i) const {
    int i = last_i;
    for (;;) {
        if (IsCloserType(Type(i))) {
            const int opener_i = OpenerBefore(i);
            if (opener_i < 0) return i;
            i = opener_i;
            if (!FollowsOperand(i)) return i;
        } else if (Is(i, kTokenId_STRING) && Is(i - 1, kTokenId_STRING)) {
        } else if (Is(i - 1, kTokenId_DOT) && EndsOperand(i - 2)) {
            --i;
        } else {
            return i;
        }
        --i;
    }
}

int CFaultyLine::ItemStart(int i) const {
    int depth = 0;
    while (--i >= 0) {
        depth += IsCloserType(Type(i)) - IsOpenerType(Type(i));
        if (depth < 0 || (depth == 0 && Is(i, kTokenId_COMMA))) return i + 1;
    }
    return 0;
}

int CFaultyLine::FindBack(int from, int to, CInventedToken token) const {
    int depth = 0;
    for (int i = to - 1; i >= from; --i) {
        if (depth == 0 && Matches(Token(i), token)) return i;
        depth += IsCloserType(Type(i)) - IsOpenerType(Type(i));
        if (depth < 0) return -1;
    }
    return -1;
}

int CFaultyLine::StatementStart(int i) const {
    if (IsField()) return 0;
    const int colon_i = IsKeyword(0) ? FindBack(0, i, kTokenId_COLON) : -1;
    return OpenerBefore(i) < 0 ? colon_i + 1 : 0;
}

int CFaultyLine::FaultWith(const CEdit& edit) const {
    return _fProbe.FaultWith(_fPart, _fOuter.in_async_def, edit);
}

CProblem CFaultyLine::Problem(ECode code, int first_i, int last_i, std::string message,
                              std::string hint) const {
    const CRawToken& first = Token(std::clamp(first_i, 0, Count() - 1));
    const CRawToken& last = Token(std::clamp(last_i, 0, Count() - 1));
    return ProblemAt(code, first.start, last.start + last.length, std::move(message), std::move(hint));
}

CProblem CFaultyLine::ProblemAt(ECode code, uint32_t start, uint32_t end, std::string message,
                                std::string hint) const {
    return {code, start, end, std::move(message), std::move(hint), {}};
}

CRelated CFaultyLine::Related(int i, std::string text) const {
    const CRawToken& token = Token(i);
    return {token.start, token.start + token.length, std::move(text)};
}

bool IsArithmeticSign(int type) {
    switch (type) {
        case kTokenId_PLUS:
        case kTokenId_MINUS:
        case kTokenId_STAR:
        case kTokenId_SLASH:
        case kTokenId_DOUBLESLASH:
        case kTokenId_PERCENT:
        case kTokenId_DOUBLESTAR:
        case kTokenId_AT:
        case kTokenId_AMPER:
        case kTokenId_VBAR:
        case kTokenId_CIRCUMFLEX:
        case kTokenId_LEFTSHIFT:
        case kTokenId_RIGHTSHIFT:
        case kTokenId_TILDE:
            return true;
        default:
            return false;
    }
}

std::string Quoted(std::string_view text) {
    constexpr size_t kLongest = 40;
    if (text.find('\n') != std::string_view::npos || text.size() > kLongest) return "it";
    if (text.find('\'') != std::string_view::npos) return std::string(text);
    std::string quoted("'");
    return quoted.append(text).append("'");
}

}  // namespace codeloom
