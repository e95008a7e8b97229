#include "names/join_tokens.h"

#include <array>

#include "text/token_type.h"
#include "tokenizer/keywords.h"
#include "tokenizer/operators.h"

namespace codeloom {

namespace {

using EPiece = CTokenJoiner::EPiece;

constexpr bool IsValue(EPiece piece) {
    return piece == EPiece::kOperand || piece == EPiece::kTrailer || piece == EPiece::kCloser;
}

// The word separates operands. `print` and `exec` are placed like names.
bool IsParting(EWord word) {
    return word != EWord::kPrint && word != EWord::kExec && !IsOperandWord(word);
}

bool EndsWithWord(std::string_view piece) {
    if (piece.back() < 'a' || piece.back() > 'z') return false;
    const size_t blank = piece.rfind(' ');
    return IsParting(WordOf(blank == std::string_view::npos ? piece : piece.substr(blank + 1)));
}

// What a piece is that isn't an operator.
EPiece KindOfExpression(std::string_view piece) {
    const bool is_attribute = piece[0] == '.' && piece.size() > 1 && piece[1] != '.' && !IsDigit(piece[1]);
    if (is_attribute || piece[0] == '(' || piece[0] == '[') return EPiece::kTrailer;
    return EndsWithWord(piece) ? EPiece::kWord : EPiece::kOperand;
}

constexpr EPiece KindOfColon(EPiece previous) {
    const bool begins_slice = previous == EPiece::kNone || previous == EPiece::kOpener ||
                              previous == EPiece::kBrace || previous == EPiece::kComma ||
                              previous == EPiece::kColon || previous == EPiece::kSliceColon;
    return begins_slice ? EPiece::kSliceColon : EPiece::kColon;
}

constexpr EPiece KindOfSign(EPiece previous, EPiece binary) {
    return IsValue(previous) ? binary : EPiece::kSign;
}

constexpr EPiece KindOfToken(int16_t type, EPiece previous) {
    switch (type) {
        case kTokenId_NAME:
        case kTokenId_NUMBER:
        case kTokenId_STRING:
        case kTokenId_ELLIPSIS:
            return EPiece::kOperand;
        case kTokenId_LPAR:
        case kTokenId_LSQB:
            return EPiece::kOpener;
        case kTokenId_LBRACE:
            return EPiece::kBrace;
        case kTokenId_RPAR:
        case kTokenId_RSQB:
        case kTokenId_RBRACE:
            return EPiece::kCloser;
        case kTokenId_COMMA:
        case kTokenId_SEMI:
            return EPiece::kComma;
        case kTokenId_COLON:
            return KindOfColon(previous);
        case kTokenId_PLUS:
        case kTokenId_MINUS:
        case kTokenId_TILDE:
        case kTokenId_STAR:
        case kTokenId_AT:
            return KindOfSign(previous, EPiece::kBinary);
        case kTokenId_DOUBLESTAR:
            return KindOfSign(previous, EPiece::kTight);
        case kTokenId_EQUAL:
        case kTokenId_DOT:
            return EPiece::kTight;
        case kTokenId_AWAIT:
        case kTokenId_ASYNC:
            return EPiece::kWord;
        default:
            return EPiece::kBinary;
    }
}

constexpr size_t kPieceCount = static_cast<size_t>(EPiece::kBinary) + 1;

// By the token type and the piece before it.
constexpr auto kTokenPieces = [] {
    std::array<std::array<EPiece, kPieceCount>, kTokenId_ASYNC + 1> pieces{};
    for (size_t type = 0; type < pieces.size(); ++type)
        for (size_t previous = 0; previous < kPieceCount; ++previous)
            pieces[type][previous] = KindOfToken(static_cast<int16_t>(type), static_cast<EPiece>(previous));
    return pieces;
}();

EPiece KindOf(std::string_view piece, EPiece previous) {
    const COperator found = OperatorAt(piece, 0);
    return found.length == piece.size() ? KindOfToken(found.type, previous) : KindOfExpression(piece);
}

// Brackets that may open a trailer do so when a value comes before them.
constexpr bool HasBlankBetween(EPiece previous, EPiece kind) {
    if (kind == EPiece::kCloser || kind == EPiece::kComma || kind == EPiece::kColon) return false;
    switch (previous) {
        case EPiece::kNone:
        case EPiece::kOpener:
        case EPiece::kBrace:
        case EPiece::kSliceColon:
        case EPiece::kTight:
        case EPiece::kSign:
            return false;
        case EPiece::kColon:
            return kind != EPiece::kSliceColon;
        case EPiece::kOperand:
        case EPiece::kTrailer:
        case EPiece::kCloser:
            return kind != EPiece::kTight && kind != EPiece::kTrailer && kind != EPiece::kOpener;
        default:
            return true;
    }
}

constexpr auto kBlanks = [] {
    std::array<std::array<bool, kPieceCount>, kPieceCount> blanks{};
    for (size_t previous = 0; previous < kPieceCount; ++previous)
        for (size_t kind = 0; kind < kPieceCount; ++kind)
            blanks[previous][kind] =
                HasBlankBetween(static_cast<EPiece>(previous), static_cast<EPiece>(kind));
    return blanks;
}();

bool HasBlank(EPiece previous, EPiece kind) {
    return kBlanks[static_cast<size_t>(previous)][static_cast<size_t>(kind)];
}

}  // namespace

void CTokenJoiner::PartFromPrevious(std::string& text, size_t start) {
    if (start == text.size()) return;
    const EPiece kind = KindOf(std::string_view(text).substr(start), _fPrevious);
    if (HasBlank(_fPrevious, kind)) text.insert(start, 1, ' ');
    _fPrevious = kind;
}

void CTokenJoiner::PartFromToken(CTextBuffer& text, int16_t token_type, EWord word) {
    const bool is_word = token_type == kTokenId_NAME && IsParting(word);
    const EPiece kind = is_word
                            ? EPiece::kWord
                            : kTokenPieces[static_cast<size_t>(token_type)][static_cast<size_t>(_fPrevious)];
    if (HasBlank(_fPrevious, kind)) text += ' ';
    _fPrevious = kind;
}

size_t CTokenJoiner::BeginPiece(CTextBuffer& text) const {
    if (HasBlank(_fPrevious, EPiece::kOperand)) text += ' ';
    return text.size();
}

void CTokenJoiner::EndPiece(CTextBuffer& text, size_t start) {
    const bool has_blank = HasBlank(_fPrevious, EPiece::kOperand);
    if (start == text.size()) {
        if (has_blank) text.CutTo(start - 1);
        return;
    }
    const EPiece kind = KindOf(text.From(start), _fPrevious);
    if (has_blank && !HasBlank(_fPrevious, kind)) text.Erase(start - 1);
    _fPrevious = kind;
}

std::string JoinTokens(std::span<const std::string_view> pieces) {
    std::string text;
    CTokenJoiner joiner;
    for (const std::string_view piece : pieces) {
        const size_t start = text.size();
        text += piece;
        joiner.PartFromPrevious(text, start);
    }
    return text;
}

}  // namespace codeloom
