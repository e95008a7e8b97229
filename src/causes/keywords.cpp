// Keywords where they can't be.

#include "tokenizer/keywords.h"

#include "causes/recognisers.h"

namespace codeloom {

namespace {

CCause KeywordAt(const CFaultyLine& line, int i) {
    if (!line.IsKeyword(i) || !line.IsSoundWith({i, 1, {kAnyName}})) return {};
    return line.Problem(
        ECode::kKeywordAsName, i, i,
        Joined(Quoted(line.Text(i)), " is a keyword and can't be used as a name"),
        line.EndsOperand(i) ? "choose another name" : Joined("write '", line.Text(i), "_' or another name"));
}

// In the same parentheses: `(for a in b: c)`.
bool HasColonAfter(const CFaultyLine& line, int i) {
    int depth = 0;
    for (; i < line.Count() && depth >= 0; ++i) {
        if (depth == 0 && line.Is(i, kTokenId_COLON)) return true;
        depth += IsOpenerType(line.Type(i)) - IsCloserType(line.Type(i));
    }
    return false;
}

}  // namespace

// `class = 1`, `def from(): pass`, `a.import`, `lambda in: 0`
CCause KeywordAsName(const CFaultyLine& line) {
    const int i = line.At();
    if (IsStatementWord(line.Word(i)) && line.Is(i - 1, kTokenId_COLON)) return {};  // `lambda: pass`
    if (CCause cause = KeywordAt(line, i)) return cause;
    const bool may_be_name = !line.IsAtEnd() && !line.BeginsOperand(i);
    return may_be_name ? KeywordAt(line, i - 1) : CCause();
}

// `x = return y`, `f(import a)`
CCause StatementInExpression(const CFaultyLine& line) {
    const int i = line.At();
    // Right after a parenthesis not even `if` goes on with an expression.
    const bool is_header = line.Is(i - 1, kTokenId_LPAR) && IsHeaderKeyword(line.Word(i)) &&
                           (!line.Is(i, EWord::kFor) || HasColonAfter(line, i));
    if (i == 0 || !line.IsKeyword(i) || line.EndsOperand(i - 1)) return {};
    if (!is_header && !IsStatementWord(line.Word(i))) return {};
    return line.Problem(
        ECode::kStatementInExpression, i, i,
        Joined(Quoted(line.Text(i)), " begins a statement and can't be part of an expression"),
        i == 1 && line.Is(0, kTokenId_LPAR)        ? "remove the parentheses around the statement"
        : line.FindBack(0, i, EWord::kLambda) >= 0 ? "the body of a lambda is an expression"
                                                   : "");
}

}  // namespace codeloom
