// What Python 2 takes: `print x`, `exec x`, `raise E, x`, backquotes.

#include "causes/recognisers.h"

namespace codeloom {

namespace {

constexpr std::string_view kSoundIn2 = "valid in Python 2";

}  // namespace

CCause CallWithoutParentheses(const CFaultyLine& line) {
    const int word_i = line.At() - 1;
    const bool is_word = line.Is(word_i, EWord::kPrint) || line.Is(word_i, EWord::kExec);
    if (!is_word || word_i != line.StatementStart(word_i) || !line.Language().IsPython3()) return {};
    if (!line.BeginsOperand(line.At())) return {};
    const std::string_view word = line.Text(word_i);
    return line.Problem(ECode::kCallWithoutParentheses, word_i, line.Count() - 1,
                        Joined("Missing parentheses in call to '", word, "'. Did you mean ", word, "(...)?"),
                        std::string(kSoundIn2));
}

CCause RaiseWithComma(const CFaultyLine& line) {
    const int i = line.At();
    const int start = line.StatementStart(i);
    if (!line.Is(i, kTokenId_COMMA) || !line.Is(start, EWord::kRaise) || line.IsInBrackets(i)) return {};
    return line.Problem(ECode::kEndedStatement, i, i, "'raise' with a comma ended with Python 2",
                        "write raise Exception(...) instead");
}

CCause Backquotes(const CFaultyLine& line) {
    if (!line.Is(line.At(), kTokenId_BACKQUOTE) && line.Text(line.At()) != "`") return {};
    return line.Problem(ECode::kEndedStatement, line.At(), line.At(), "backquotes ended with Python 2",
                        "write repr(...) instead");
}

}  // namespace codeloom
