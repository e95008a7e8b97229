#include "neighbours/tokenizer/row_facts.h"

#include "neighbours/tokenizer/operands.h"

namespace codeloom {

namespace {

EByteKind FirstKind(const CRawToken& token) {
    return token.text.empty() ? EByteKind::kBlank : ByteKind(token.text.front());
}

// The kind of the last byte, which for strings without closing quotes is that of swallowed code.
EByteKind LastKind(const CRawToken& token) {
    return token.text.empty() ? EByteKind::kBlank : ByteKind(token.text.back());
}

bool IsString(const CRawToken& token) {
    return BeginsString(token.text, 0);
}

// Calls `visit` with each token and the number of brackets open at it, an opener and a closer counted as
// open, and less than zero behind a closer of an outer bracket. Ends when `visit` returns true, and tells
// that.
template <class Visit>
bool AnyToken(const CTokenRow& row, Visit visit) {
    int depth = 0;
    for (const CRawToken& token : row.tokens) {
        if (FirstKind(token) == EByteKind::kOpener) ++depth;
        if (visit(token, depth)) return true;
        if (FirstKind(token) == EByteKind::kCloser) --depth;
    }
    return false;
}

bool EndsInOpenerOrOperator(const CRawToken& last) {
    const EByteKind kind = LastKind(last);
    return kind == EByteKind::kOpener ||
           (kind == EByteKind::kOperator && last.text.back() != ':' && last.text.back() != ';');
}

}  // namespace

bool IsComment(const CTokenRow& row) {
    return row.tokens.empty();
}

bool BeginsWithCloser(const CTokenRow& row) {
    return ByteKind(row.text.front()) == EByteKind::kCloser;
}

// Behind an opener no `for` and no `if` can continue an expression.
bool BeginsStatement(const CTokenRow& row) {
    if (StartsStatement(row.text, 0)) return true;
    const bool is_behind_opener = LastKind(row.before) == EByteKind::kOpener;
    return is_behind_opener && IsHeaderKeyword(WordAt(row.text, 0)) && !ClosesOuterBracket(row);
}

bool ContinuesExpression(const CTokenRow& row) {
    return ContinuesExpression(row.text, 0);
}

bool FollowsOperand(const CTokenRow& row) {
    return !row.before.text.empty() && AreOperandsSideBySide(row.before, row.text, 0);
}

bool BeginsWithTwoOperands(const CTokenRow& row) {
    return row.tokens.size() > 1 && AreOperandsSideBySide(row.tokens[0], row.tokens[1].text, 0);
}

bool ClosesOuterBracket(const CTokenRow& row) {
    return AnyToken(row, [](const CRawToken& token, int depth) {
        return FirstKind(token) == EByteKind::kCloser && depth <= 0;
    });
}

bool HasAssignment(const CTokenRow& row) {
    return AnyToken(row, [](const CRawToken& token, int depth) { return depth <= 0 && token.text == "="; });
}

bool EndsInColon(const CTokenRow& row) {
    return !row.tokens.empty() && row.tokens.back().text.back() == ':';
}

bool HasBody(const CTokenRow& row) {
    return !EndsInColon(row) &&
           AnyToken(row, [](const CRawToken& token, int depth) { return depth <= 0 && token.text == ":"; });
}

bool EndsOpen(const CTokenRow& row) {
    return !row.tokens.empty() && EndsInOpenerOrOperator(row.tokens.back());
}

bool EndsOpenByItself(const CTokenRow& row) {
    if (!EndsOpen(row)) return false;
    int last_depth = 0;
    AnyToken(row, [&](const CRawToken&, int depth) {
        last_depth = depth;
        return false;
    });
    return last_depth <= 0;
}

bool HasOpenQuote(const CTokenRow& row) {
    return AnyToken(row, [](const CRawToken& token, int) {
        return token.type == kTokenId_ERRORTOKEN && IsString(token);
    });
}

bool HasTripleQuotes(const CTokenRow& row) {
    return AnyToken(row, [](const CRawToken& token, int) {
        return IsString(token) && ReadStringStart(token.text, 0).IsTriple();
    });
}

bool IsBroken(const CTokenRow& row) {
    for (size_t token_i = 0; token_i < row.tokens.size(); ++token_i) {
        const CRawToken& token = row.tokens[token_i];
        if (token.type == kTokenId_ERRORTOKEN) return true;
        const CRawToken* last = token_i > 0 ? &row.tokens[token_i - 1] : nullptr;
        const bool is_behind_soft_keyword = token_i == 1 && IsSoftKeyword(last->text);
        if (last && !is_behind_soft_keyword && AreOperandsSideBySide(*last, token.text, 0)) return true;
        if (IsString(token) && ReadStringStart(token.text, 0).IsTriple()) return false;
    }
    return false;
}

bool LooksLikeProse(const CTokenRow& row) {
    if (row.tokens.empty()) return false;
    const CRawToken& last = row.tokens.back();
    // An empty string alone is what is left of triple quotes.
    if (row.tokens.size() == 1 && (last.text == "\"\"" || last.text == "''")) return true;
    if (row.stray_closer_end || last.text == ".") return true;
    for (size_t token_i = 1; token_i < row.tokens.size(); ++token_i) {
        const bool is_behind_dot = row.tokens[token_i - 1].text == ".";
        if (is_behind_dot && FirstKind(row.tokens[token_i]) != EByteKind::kNameStart) return true;
    }
    if (row.is_in_brackets) return false;
    const bool is_label = EndsInColon(row) && !IsCompoundWord(WordAt(row.text, 0));
    const bool is_dangling = EndsOpenByItself(row) && last.text != "," && last.text != "*";
    return ContinuesExpression(row) || is_label || is_dangling;
}

}  // namespace codeloom
