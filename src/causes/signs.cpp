// Signs of other languages: `!x`, `a ? b : c`, `===`.

#include "causes/recognisers.h"

namespace codeloom {

CCause ForeignSign(const CFaultyLine& line, int i) {
    if (line.Is(i, kTokenId_ERRORTOKEN) && line.Text(i) == "!" && !line.IsField())
        return line.Problem(ECode::kForeignSign, i, i, "'!' isn't an operator in Python", "write 'not'");
    if (line.Is(i, kTokenId_ERRORTOKEN) && line.Text(i) == "?")
        return line.Problem(ECode::kForeignSign, i, i, "'?' isn't an operator in Python",
                            "write 'a if condition else b'");
    if (line.Is(i, kTokenId_AMPER) && line.Is(i - 1, kTokenId_AMPER) && line.IsAdjacent(i))
        return line.Problem(ECode::kForeignSign, i - 1, i, "'&&' isn't an operator in Python", "write 'and'");
    if (line.Is(i, kTokenId_VBAR) && line.Is(i - 1, kTokenId_VBAR) && line.IsAdjacent(i))
        return line.Problem(ECode::kForeignSign, i - 1, i, "'||' isn't an operator in Python", "write 'or'");
    const bool is_comparison = line.Is(i - 1, kTokenId_EQEQUAL) || line.Is(i - 1, kTokenId_NOTEQUAL);
    if (line.Is(i, kTokenId_EQUAL) && is_comparison && line.IsAdjacent(i))
        return line.Problem(ECode::kForeignSign, i - 1, i,
                            Joined(Quoted(Joined(line.Text(i - 1), "=")), " isn't an operator in Python"),
                            Joined("write ", Quoted(line.Text(i - 1)), ", or 'is' for the same object"));
    if (line.Is(i, kTokenId_COLONEQUAL) && line.Is(i + 1, kTokenId_EQUAL) && line.IsAdjacent(i + 1))
        return line.Problem(ECode::kForeignSign, i, i + 1, "':==' isn't an operator in Python",
                            "write '==' or ':='");
    if (line.Is(i, EWord::kArrow) && line.EndsOperand(i - 1) && line.BeginsOperand(i + 1) &&
        !line.IsKeyword(0))
        return line.Problem(ECode::kForeignSign, i, i, "'->' isn't an operator in Python",
                            "write '.' for an attribute");
    if (line.Is(i, EWord::kLessGreater) && line.Language().IsPython3())
        return line.Problem(ECode::kForeignSign, i, i, "'<>' ended with Python 2", "write '!='");
    return {};
}

}  // namespace codeloom
