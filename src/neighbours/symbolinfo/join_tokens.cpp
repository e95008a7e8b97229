#include "neighbours/symbolinfo/join_tokens.h"

#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/operators.h"

namespace codeloom {

namespace {

using EPiece = CTokenJoiner::EPiece;

bool IsValue(EPiece piece) {
    return piece == EPiece::kOperand || piece == EPiece::kTrailer || piece == EPiece::kCloser;
}

bool EndsWithWord(std::string_view piece) {
    const size_t blank = piece.rfind(' ');
    const std::string_view last = blank == std::string_view::npos ? piece : piece.substr(blank + 1);
    return !last.empty() && WordAt(last, 0).size() == last.size() && last != "print" && last != "exec" &&
           !IsOperandWord(last);
}

// What a piece is that is no operator.
EPiece KindOfExpression(std::string_view piece) {
    const bool is_attribute = piece[0] == '.' && piece.size() > 1 && piece[1] != '.' && !IsDigit(piece[1]);
    if (is_attribute || piece[0] == '(' || piece[0] == '[') return EPiece::kTrailer;
    return EndsWithWord(piece) ? EPiece::kWord : EPiece::kOperand;
}

EPiece KindOfColon(EPiece previous) {
    const bool begins_slice = previous == EPiece::kNone || previous == EPiece::kOpener ||
                              previous == EPiece::kComma || previous == EPiece::kColon ||
                              previous == EPiece::kSliceColon;
    return begins_slice ? EPiece::kSliceColon : EPiece::kColon;
}

EPiece KindOfOperator(std::string_view piece, EPiece previous) {
    if (piece == "...") return EPiece::kOperand;
    if (piece == ":") return KindOfColon(previous);
    if (piece == "," || piece == ";") return EPiece::kComma;
    if (ByteKind(piece[0]) == EByteKind::kOpener) return EPiece::kOpener;
    if (ByteKind(piece[0]) == EByteKind::kCloser) return EPiece::kCloser;
    const bool may_be_sign =
        piece == "+" || piece == "-" || piece == "~" || piece == "*" || piece == "**" || piece == "@";
    if (may_be_sign && !IsValue(previous)) return EPiece::kSign;
    return piece == "**" || piece == "=" || piece == "." ? EPiece::kTight : EPiece::kBinary;
}

EPiece KindOf(std::string_view piece, EPiece previous) {
    const bool is_operator = OperatorAt(piece, 0).length == piece.size();
    return is_operator ? KindOfOperator(piece, previous) : KindOfExpression(piece);
}

// A bracket opens a trailer when a value stands before it.
bool IsTrailerAt(EPiece kind, char first) {
    return kind == EPiece::kTrailer || (kind == EPiece::kOpener && first != '{');
}

bool HasBlankBetween(EPiece previous, EPiece kind, char first) {
    if (kind == EPiece::kCloser || kind == EPiece::kComma || kind == EPiece::kColon) return false;
    switch (previous) {
        case EPiece::kNone:
        case EPiece::kOpener:
        case EPiece::kSliceColon:
        case EPiece::kTight:
        case EPiece::kSign:
            return false;
        case EPiece::kColon:
            return kind != EPiece::kSliceColon;
        case EPiece::kOperand:
        case EPiece::kTrailer:
        case EPiece::kCloser:
            return kind != EPiece::kTight && !IsTrailerAt(kind, first);
        default:
            return true;
    }
}

}  // namespace

void CTokenJoiner::PartFromPrevious(std::string& text, size_t start) {
    if (start == text.size()) return;
    const EPiece kind = KindOf(std::string_view(text).substr(start), _fPrevious);
    if (HasBlankBetween(_fPrevious, kind, text[start])) text.insert(start, 1, ' ');
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
