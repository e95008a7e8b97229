// `=` where a comparison or `:=` is meant, and `:=` as a statement.

#include <string_view>

#include "causes/recognisers.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

std::string_view KindOfLiteral(std::string_view text) {
    return ReadStringStart(text, 0).has_fields ? "f-string expression" : "literal";
}

// What the operand is that ends before the token; empty for a plain name, which `:=` may bind.
std::string_view KindBefore(const CFaultyLine& line, int i) {
    const int last_i = i - 1;
    const int start = line.OperandStart(last_i);
    if (IsArithmeticSign(line.Type(start - 1)) && start > 0 &&
        !(line.Is(start - 1, kTokenId_AT) && start == 1))
        return "expression";
    switch (line.Type(last_i)) {
        case kTokenId_NUMBER:
            return "literal";
        case kTokenId_STRING:
            return KindOfLiteral(line.Text(last_i));
        case kTokenId_ELLIPSIS:
            return "ellipsis";
        case kTokenId_RPAR:
            return line.FollowsOperand(line.OpenerBefore(last_i)) ? "function call" : "tuple";
        case kTokenId_RSQB:
            return line.FollowsOperand(line.OpenerBefore(last_i)) ? "subscript" : "list";
        case kTokenId_RBRACE:
            return "set display";
        default:
            if (line.IsKeyword(last_i)) return line.Text(last_i);
            return start == last_i ? "" : "attribute";
    }
}

}  // namespace

CCause AssignmentForComparison(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, kTokenId_EQUAL) || !line.EndsOperand(i - 1)) return {};
    if (line.FaultWith({i, 1, {kTokenId_EQEQUAL}}) <= i + 1) return {};
    const std::string_view kind = KindBefore(line, i);
    const int start = line.OperandStart(i - 1);
    const int opener_i = line.OpenerBefore(i);
    const bool may_be_entry = opener_i >= 0 && line.Is(opener_i, kTokenId_LBRACE);
    const std::string hint =
        may_be_entry ? "write ':' between a key and its value, or '==' to compare" : "write '==' to compare";
    if (kind.empty())
        return line.Problem(ECode::kAssignmentForComparison, start, i,
                            "invalid syntax. Maybe you meant '==' or ':=' instead of '='?", hint);
    return line.Problem(ECode::kAssignmentForComparison, start, i,
                        Joined("cannot assign to ", kind, " here. Maybe you meant '==' instead of '='?"),
                        hint);
}

CCause WalrusStatement(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, kTokenId_COLONEQUAL)) return {};
    if (line.IsSoundWith({i, 1, {kTokenId_EQUAL}}))
        return line.Problem(ECode::kWalrusStatement, i, i,
                            "':=' needs parentheses around it where it is a statement",
                            "write '=' to assign");
    return {};
}

}  // namespace codeloom
