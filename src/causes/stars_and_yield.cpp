// Stars and `yield` where an expression is expected that can't begin with them.

#include "causes/recognisers.h"

namespace codeloom {

CCause StarHere(const CFaultyLine& line) {
    const int i = line.At();
    const bool is_double = line.Is(i, kTokenId_DOUBLESTAR);
    if ((!is_double && !line.Is(i, kTokenId_STAR)) || line.EndsOperand(i - 1)) return {};
    if (!line.BeginsOperand(i + 1) || !line.Takes(kTokenId_NUMBER)) return {};
    return line.Problem(
        ECode::kMisplacedStar, i, i + 1,
        is_double ? "cannot use double starred expression here" : "cannot use starred expression here");
}

CCause YieldHere(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, EWord::kYield) || i == 0 || !line.Takes(kTokenId_NUMBER)) return {};
    return line.Problem(ECode::kStatementInExpression, i, i, "a yield expression must be parenthesized here");
}

}  // namespace codeloom
