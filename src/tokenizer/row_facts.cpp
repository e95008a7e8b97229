#include "tokenizer/row_facts.h"

#include "tokenizer/operands.h"

namespace codeloom {

namespace {

EByteKind FirstKind(const CRowToken& token) {
    return token.text.empty() ? EByteKind::kBlank : ByteKind(token.text.front());
}

// The kind of the last byte, which for strings without closing quotes is that of swallowed code.
EByteKind LastKind(const CRowToken& token) {
    return token.text.empty() ? EByteKind::kBlank : ByteKind(token.text.back());
}

bool IsString(const CRowToken& token) {
    return BeginsString(token.text, 0);
}

bool IsTriple(const CRowToken& token) {
    return IsString(token) && ReadStringStart(token.text, 0).IsTriple();
}

// Calls `visit` with each token and the number of brackets open at it, an opener and a closer counted as
// open, and less than zero after a closer of an outer bracket. Ends when `visit` returns true, and says
// whether it did.
template <class Visit>
bool AnyToken(const CTokenRow& row, Visit visit) {
    int depth = 0;
    for (const CRowToken& token : row.tokens) {
        if (FirstKind(token) == EByteKind::kOpener) ++depth;
        if (visit(token, depth)) return true;
        if (FirstKind(token) == EByteKind::kCloser) --depth;
    }
    return false;
}

// The number of the row's own brackets that are open at its last token.
int LastDepth(const CTokenRow& row) {
    int last_depth = 0;
    AnyToken(row, [&](const CRowToken&, int depth) {
        last_depth = depth;
        return false;
    });
    return last_depth;
}

bool EndsInOpenerOrOperator(const CRowToken& last) {
    const EByteKind kind = LastKind(last);
    return kind == EByteKind::kOpener ||
           (kind == EByteKind::kOperator && last.text.back() != ':' && last.text.back() != ';');
}

bool IsWholeStatement(EWord word) {
    return word == EWord::kPass || word == EWord::kBreak || word == EWord::kContinue;
}

}  // namespace

bool IsComment(const CTokenRow& row) {
    return row.tokens.empty();
}

bool BeginsWithCloser(const CTokenRow& row) {
    return ByteKind(row.text.front()) == EByteKind::kCloser;
}

bool HasOuterColon(const CTokenRow& row) {
    return AnyToken(row, [](const CRowToken& token, int depth) { return depth <= 0 && token.text == ":"; });
}

// After an opener no `for` and no `if` can continue an expression.
bool BeginsStatement(const CTokenRow& row) {
    if (StartsStatement(row.text, 0)) return true;
    const bool is_after_opener = LastKind(row.before) == EByteKind::kOpener;
    if (!is_after_opener || !IsHeaderKeyword(WordAt(row.text, 0))) return false;
    return !ClosesOuterBracket(row) || HasOuterColon(row);
}

bool BeginsHeader(const CTokenRow& row) {
    const EWord word = WordAt(row.text, 0);
    if (word == EWord::kElse) return row.tokens.size() > 1 && row.tokens[1].text == ":";
    if (word != EWord::kIf && word != EWord::kFor && word != EWord::kAsync) return false;
    bool is_header = false;
    AnyToken(row, [&](const CRowToken& token, int depth) {
        is_header = depth == 0 && token.text == ":";
        return is_header || depth < 0 || token.word == EWord::kElse || token.word == EWord::kLambda;
    });
    return is_header;
}

bool IsHeader(const CTokenRow& row) {
    return EndsInColon(row) && IsCompoundWord(WordAt(row.text, 0));
}

bool BeginsDefinition(const CTokenRow& row) {
    if (row.tokens.empty()) return false;
    const bool is_async = row.tokens.size() > 1 && row.tokens[0].word == EWord::kAsync;
    const EWord word = row.tokens[is_async].word;
    return word == EWord::kDef || word == EWord::kClass;
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
    return AnyToken(row, [](const CRowToken& token, int depth) {
        return FirstKind(token) == EByteKind::kCloser && depth <= 0;
    });
}

bool HasAssignment(const CTokenRow& row) {
    return AnyToken(row, [](const CRowToken& token, int depth) { return depth <= 0 && token.text == "="; });
}

bool AssignsToPart(const CTokenRow& row) {
    bool is_part = false;
    return AnyToken(row, [&is_part](const CRowToken& token, int depth) {
        is_part |= depth <= 0 && token.text == ".";
        return is_part && depth <= 0 && token.text == "=";
    });
}

bool EndsInColon(const CTokenRow& row) {
    return !row.tokens.empty() && row.tokens.back().text.back() == ':';
}

bool EndsInOuterColon(const CTokenRow& row) {
    return EndsInColon(row) && LastDepth(row) <= 0;
}

bool EndsAfterColon(const CTokenRow& row) {
    const size_t count = row.tokens.size();
    return count > 1 && FirstKind(row.tokens[count - 1]) == EByteKind::kOpener &&
           row.tokens[count - 2].text == ":";
}

bool HasBody(const CTokenRow& row) {
    return !EndsInColon(row) && HasOuterColon(row);
}

bool EndsOpen(const CTokenRow& row) {
    return !row.tokens.empty() && EndsInOpenerOrOperator(row.tokens.back());
}

bool EndsOpenByItself(const CTokenRow& row) {
    return EndsOpen(row) && LastDepth(row) <= 0;
}

bool HasOpenQuote(const CTokenRow& row) {
    return AnyToken(row, [](const CRowToken& token, int) {
        return token.type == kTokenId_ERRORTOKEN && IsString(token);
    });
}

bool EndsInOpenTriple(const CTokenRow& row) {
    return !row.tokens.empty() && row.tokens.back().type == kTokenId_ERRORTOKEN &&
           IsTriple(row.tokens.back());
}

bool HasTripleQuotes(const CTokenRow& row) {
    return AnyToken(row, [](const CRowToken& token, int) { return IsTriple(token); });
}

bool IsBroken(const CTokenRow& row) {
    const bool is_import = !row.tokens.empty() && row.tokens[0].word == EWord::kFrom;
    for (size_t token_i = 0; token_i < row.tokens.size(); ++token_i) {
        const CRowToken& token = row.tokens[token_i];
        if (token.type == kTokenId_ERRORTOKEN) return true;
        if (token_i == 0 && IsTriple(token)) return false;
        if (token_i == 0) continue;
        const CRowToken& last = row.tokens[token_i - 1];
        if (last.text == "." && !is_import && token.type != kTokenId_NAME) return true;
        if (IsWholeStatement(last.word) && token.text != ";") return true;
        const bool is_after_soft_keyword = token_i == 1 && IsSoftKeyword(last.word);
        if (!is_after_soft_keyword && AreOperandsSideBySide(last, token.text, 0)) return true;
        if (IsTriple(token)) return false;
    }
    return false;
}

bool LooksLikeProse(const CTokenRow& row) {
    if (row.tokens.empty()) return false;
    const CRowToken& last = row.tokens.back();
    if (row.stray_closer_end || last.text == ".") return true;
    if (row.is_in_brackets) return false;
    const bool is_label = EndsInOuterColon(row) && !IsCompoundWord(WordAt(row.text, 0));
    const bool is_dangling = EndsOpenByItself(row) && last.text != "," && last.text != "*";
    return ContinuesExpression(row) || is_label || is_dangling;
}

}  // namespace codeloom
