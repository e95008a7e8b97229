// Operators: `a + not b`, `i++`, `a + = b`.

#include "causes/recognisers.h"

namespace codeloom {

namespace {

bool IsComparison(int type) {
    return (type >= kTokenId_EQEQUAL && type <= kTokenId_GREATEREQUAL) || type == kTokenId_LESS ||
           type == kTokenId_GREATER;
}

// `=<`, whose second sign is at `i`.
CCause SwappedAt(const CFaultyLine& line, int i) {
    return line.Problem(
        ECode::kForeignSign, i - 1, i,
        Joined(Quoted(Joined(line.Text(i - 1), line.Text(i))), " isn't an operator in Python"),
        Joined("write ", Quoted(Joined(line.Text(i), line.Text(i - 1)))));
}

}  // namespace

CCause NotAfterOperator(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, EWord::kNot) || (!IsArithmeticSign(line.Type(i - 1)) && !IsComparison(line.Type(i - 1))))
        return {};
    return line.Problem(ECode::kNotAfterOperator, i - 1, i, "'not' after an operator must be parenthesized");
}

// `i++`, `i--`
CCause Increment(const CFaultyLine& line) {
    const int i = line.At();
    const bool is_sign = line.Is(i - 1, kTokenId_PLUS) || line.Is(i - 1, kTokenId_MINUS);
    if (!is_sign || line.Type(i - 2) != line.Type(i - 1) || !line.IsAdjacent(i - 1) ||
        !line.EndsOperand(i - 3))
        return {};
    const std::string sign = Joined(line.Text(i - 1), line.Text(i - 1));
    return line.Problem(ECode::kForeignSign, i - 2, i - 1,
                        Joined(Quoted(sign), " isn't an operator in Python"),
                        Joined("write '", line.Text(i - 1), "= 1'"));
}

// `a + = b`, `a < = b`, `a =< b`, `a => b`
CCause SplitOperator(const CFaultyLine& line) {
    const int i = line.At();
    if (i == 0) return {};
    const bool is_before = line.Is(i, kTokenId_EQUAL) && line.IsAdjacent(i + 1) &&
                           (line.Is(i + 1, kTokenId_LESS) || line.Is(i + 1, kTokenId_GREATER));
    if (is_before) return SwappedAt(line, i + 1);
    const std::string together = Joined(line.Text(i - 1), line.Text(i));
    if (line.Is(i, kTokenId_EQUAL) && !line.IsAdjacent(i) && !IsOpenerType(line.Type(i - 1)) &&
        !line.Is(i - 1, kTokenId_COLON)) {
        const int type = GetTokenType(together);
        if (type != kTokenId_ERRORTOKEN && line.FaultWith({i - 1, 2, {static_cast<int16_t>(type)}}) > i)
            return line.Problem(ECode::kSplitOperator, i - 1, i,
                                Joined("there can't be a blank within ", Quoted(together)));
    }
    if (!line.Is(i - 1, kTokenId_EQUAL) || !line.IsAdjacent(i)) return {};
    const bool is_swapped = line.Is(i, kTokenId_LESS) || line.Is(i, kTokenId_GREATER);
    return is_swapped ? SwappedAt(line, i) : CCause();
}

}  // namespace codeloom
