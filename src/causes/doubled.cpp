// A word or a sign that is written twice: `return return x`, `f(a,, b)`.

#include "causes/recognisers.h"

namespace codeloom {

CCause Doubled(const CFaultyLine& line) {
    const int i = line.At();
    if (i == 0 || line.IsAtEnd() || line.Text(i) != line.Text(i - 1) || line.IsOnNextRow(i)) return {};
    const bool may_lack_comma = line.IsInBrackets(i) && line.EndsOperand(i);
    const bool is_literal = line.Is(i, kTokenId_NUMBER) || line.Is(i, kTokenId_STRING);
    if (may_lack_comma || is_literal || !line.IsSoundWith({i, 1, {}})) return {};
    return line.Problem(ECode::kDoubled, i, i, Joined(Quoted(line.Text(i)), " is written twice"),
                        "leave one out");
}

}  // namespace codeloom
