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

}  // namespace

// `class = 1`, `def from(): pass`, `a.import`, `lambda in: 0`
CCause KeywordAsName(const CFaultyLine& line) {
    const int i = line.At();
    if (CCause cause = KeywordAt(line, i)) return cause;
    const bool may_be_name = !line.IsAtEnd() && !line.BeginsOperand(i);
    return may_be_name ? KeywordAt(line, i - 1) : CCause();
}

// `x = return y`, `f(import a)`
CCause StatementInExpression(const CFaultyLine& line) {
    const int i = line.At();
    if (i == 0 || !line.IsKeyword(i) || !IsStatementWord(line.Word(i)) || line.EndsOperand(i - 1)) return {};
    return line.Problem(
        ECode::kStatementInExpression, i, i,
        Joined(Quoted(line.Text(i)), " begins a statement and can't be part of an expression"));
}

}  // namespace codeloom
