// Headers of compound statements.

#include "causes/recognisers.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

bool BeginsHeader(const CFaultyLine& line, int i) {
    const EWord word = line.Word(i);
    return IsCompoundWord(word) && (i == 0 || !IsSoftKeyword(word));
}

int HeadWord(const CFaultyLine& line) {
    return line.Is(0, EWord::kAsync) ? 1 : 0;
}

// A sign that was written where the colon should be.
bool MayStandForColon(int type) {
    return type == kTokenId_SEMI || type == kTokenId_EQUAL || type == kTokenId_COMMA ||
           type == kTokenId_LBRACE || type == kTokenId_COLONEQUAL || type == kTokenId_RARROW;
}

CProblem ColonMissingAfter(const CFaultyLine& line, int i) {
    return line.Problem(ECode::kMissingColon, i, i, "expected ':'",
                        Joined("end the header of ", Quoted(line.Text(HeadWord(line))), " with ':'"));
}

// `except A as a.b:`
CCause CaughtName(const CFaultyLine& line, int as_i) {
    const int i = line.At();
    const std::string_view kind = line.Is(i, kTokenId_DOT)    ? "attribute"
                                  : line.Is(i, kTokenId_LSQB) ? "subscript"
                                  : line.Is(i, kTokenId_LPAR) ? "function call"
                                                              : "";
    if (i != as_i + 2 || kind.empty()) return {};
    return line.Problem(ECode::kCannotAssign, as_i + 1, i, Joined("cannot use except statement with ", kind),
                        "bind a plain name");
}

}  // namespace

CCause ExceptFault(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(0, EWord::kExcept) || line.OpenerBefore(i) >= 0) return {};
    if (line.Is(i, kTokenId_STAR) && line.Is(i + 1, kTokenId_COLON))
        return line.Problem(ECode::kMissingExceptTypes, i, i, "expected one or more exception types");
    if (const int as_i = line.FindBack(0, i, EWord::kAs); as_i >= 0) return CaughtName(line, as_i);
    if (!line.Is(i, kTokenId_COMMA)) return {};
    const int colon_i = line.FindBack(i, line.Count(), kTokenId_COLON);
    int last_i = (colon_i < 0 ? line.Count() : colon_i) - 1;
    if (const int as_i = line.FindBack(i, last_i, EWord::kAs); as_i > 0) last_i = as_i - 1;
    const int first_i = line.Is(1, kTokenId_STAR) ? 2 : 1;
    return line.Problem(ECode::kUnparenthesizedTypes, first_i, last_i,
                        line.Language().version >= 314
                            ? "multiple exception types must be parenthesized when using 'as'"
                            : "multiple exception types must be parenthesized",
                        "write 'except (A, B)'; 'except A, name' of Python 2 is 'except A as name'");
}

// `else if x:`, `else x:`
CCause ElseIf(const CFaultyLine& line) {
    if (!line.Is(0, EWord::kElse) || line.At() != 1) return {};
    const bool has_if = line.Is(1, EWord::kIf);
    if (!line.IsSoundWith({0, has_if ? 2 : 1, {EWord::kElif}})) return {};
    return line.Problem(ECode::kMissingColon, 0, has_if ? 1 : 0, "expected ':' after 'else'", "write 'elif'");
}

// `async f()`
CCause AsyncAlone(const CFaultyLine& line) {
    if (line.At() != 1 || !line.Is(0, EWord::kAsync) || !line.IsKeyword(0)) return {};
    return line.Problem(ECode::kMissingToken, 0, 0, "expected 'def', 'for' or 'with' after 'async'");
}

CCause DefinitionHead(const CFaultyLine& line) {
    const int word_i = HeadWord(line);
    const bool is_def = line.Is(word_i, EWord::kDef);
    const int i = line.At();
    const bool is_alias = line.Is(word_i, EWord::kType) && i > word_i + 1;
    if (!is_def && !is_alias && !line.Is(word_i, EWord::kClass)) return {};
    if (i == word_i + 1 && !line.IsKeyword(i) && !line.Is(i, kTokenId_EQUAL) &&
        !line.Is(i, kTokenId_ERRORTOKEN))
        return line.Problem(ECode::kMissingName, line.IsAtEnd() ? word_i : i, i,
                            Joined("expected a name after ", Quoted(line.Text(word_i))));
    const int closer_i = line.Is(word_i + 2, kTokenId_LSQB) ? line.CloserOf(word_i + 2) : 0;
    if (closer_i == word_i + 3 && i == closer_i)
        return line.Problem(ECode::kMissingName, i - 1, i, "Type parameter list cannot be empty");
    const bool is_after_name = i == word_i + 2 || (closer_i > 0 && i == closer_i + 1);
    if (is_after_name && line.Is(word_i, EWord::kClass) && line.Is(i, kTokenId_DOT))
        return line.Problem(ECode::kMissingColon, i - 1, i + 1, "expected ':' or '(' after the class's name",
                            "a definition binds a plain name");
    if (!is_def || !is_after_name) return {};
    if (line.Is(i, kTokenId_DOT))
        return line.Problem(ECode::kMissingParenthesis, i - 1, i + 1,
                            "expected '(' after the function's name", "a definition binds a plain name");
    return line.Problem(ECode::kMissingParenthesis, i - 1, i - 1, "expected '('",
                        "a function without parameters has '()'");
}

// `for x range(9):`, `[x for x if y]`
CCause MissingIn(const CFaultyLine& line) {
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    const int for_i = line.FindBack(opener_i + 1, i, EWord::kFor);
    if (for_i < 0 || line.FindBack(for_i, i, EWord::kIn) >= 0) return {};
    const auto mends = [&](const CEdit& edit) { return line.FaultWith(edit) > i + 2; };
    if (!line.Takes(EWord::kIn)) return {};
    const bool is_other_word =
        line.Is(i, EWord::kIf) || line.Is(i, kTokenId_EQUAL) || line.Is(i, kTokenId_COLON);
    if (!line.IsAtEnd() && !is_other_word && !mends({i, 0, {EWord::kIn}}) && !mends({i, 1, {EWord::kIn}}))
        return {};
    return line.Problem(ECode::kMissingIn, for_i, i - 1, "'in' expected after for-loop variables");
}

// `if a: for b in c: d`
CCause NestedHeader(const CFaultyLine& line) {
    const int i = line.At();
    if (i == 0 || !line.Is(i - 1, kTokenId_COLON) || !BeginsHeader(line, i) || line.IsInBrackets(i))
        return {};
    if (line.FindBack(i, line.Count(), kTokenId_COLON) < 0) return {};
    return line.Problem(ECode::kNestedHeader, i, i,
                        Joined("a statement with a block, such as ", Quoted(line.Text(i)),
                               ", can't follow ':' on the same row"),
                        "begin a new row, indented deeper");
}

CCause MissingColon(const CFaultyLine& line) {
    const int i = line.At();
    if (line.IsField() || !BeginsHeader(line, 0)) return {};
    if (line.IsSoundWith({line.Count(), 0, {kTokenId_COLON}}))
        return ColonMissingAfter(line, line.Count() - 1);
    if (line.OpenerBefore(i) >= 0 && !line.Is(i, kTokenId_LBRACE)) return {};
    if (line.FindBack(0, i, kTokenId_COLON) >= 0 && line.FindBack(0, i, EWord::kLambda) < 0) return {};
    const bool is_sign = MayStandForColon(line.Type(i));
    const bool is_brace = line.Is(i, kTokenId_LBRACE);
    const bool is_instead =
        is_sign && (is_brace || i + 1 == line.Count() || line.IsSoundWith({i, 1, {kTokenId_COLON}}));
    const bool is_left_out = !is_sign && (line.IsAtEnd() ? line.Takes(kTokenId_COLON)
                                                         : line.IsSoundWith({i, 0, {kTokenId_COLON}}));
    if (!is_instead && !is_left_out) return {};
    if (is_instead && !line.Takes(kTokenId_COLON)) return {};
    if (!is_instead) return ColonMissingAfter(line, i - 1);
    return line.Problem(ECode::kMissingColon, i, i, "expected ':'",
                        is_brace ? "write ':' instead of '{', and indent the block"
                                 : Joined("write ':' instead of ", Quoted(line.Text(i))));
}

}  // namespace codeloom
