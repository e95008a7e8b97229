// What is missing, by what the parser would have taken.

#include <array>

#include "causes/recognisers.h"

namespace codeloom {

namespace {

// Words for a place: "after '='", "before ')'".
std::string PlaceOf(const CFaultyLine& line) {
    const int i = line.At();
    if (i > 0 && (line.IsAtEnd() || !line.EndsOperand(i - 1)))
        return Joined("after ", Quoted(line.Text(i - 1)));
    return Joined("before ", Quoted(line.Text(i)));
}

}  // namespace

// `a if b`
CCause MissingElse(const CFaultyLine& line) {
    const int i = line.At();
    const int if_i = line.FindBack(line.OpenerBefore(i) + 1, i, EWord::kIf);
    if (if_i < 1 || !line.EndsOperand(if_i - 1) || line.FindBack(if_i, i, EWord::kElse) >= 0) return {};
    if (!line.EndsOperand(i - 1) || !line.Takes(EWord::kElse)) return {};
    return line.Problem(ECode::kMissingElse, line.OperandStart(if_i - 1), i - 1,
                        "expected 'else' after 'if' expression");
}

// `lambda a b: a`, `lambda a = 1`
CCause LambdaFault(const CFaultyLine& line) {
    const int i = line.At();
    const int lambda_i = line.FindBack(line.OpenerBefore(i) + 1, i, EWord::kLambda);
    if (lambda_i < 0 || line.FindBack(lambda_i, i, kTokenId_COLON) >= 0) return {};
    if (line.IsName(i) && line.EndsOperand(i - 1) && line.IsSoundWith({i, 0, {kTokenId_COMMA}}))
        return line.Problem(ECode::kMissingComma, i - 1, i, "invalid syntax. Perhaps you forgot a comma?",
                            Joined("write ',' before ", Quoted(line.Text(i))));
    const bool is_early = line.IsAtEnd() || IsCloserType(line.Type(i)) || line.Is(i, kTokenId_COMMA);
    if (!is_early || !line.Takes(kTokenId_COLON)) return {};
    return line.Problem(ECode::kMissingColon, lambda_i, i - 1,
                        "expected ':' after the parameters of 'lambda'");
}

CCause MissingComma(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.IsInBrackets(i) || !line.EndsOperand(i - 1) || !line.BeginsOperand(i)) return {};
    if (!line.Takes(kTokenId_COMMA)) return {};
    return line.Problem(ECode::kMissingComma, line.OperandStart(i - 1), i,
                        "invalid syntax. Perhaps you forgot a comma?",
                        Joined("write ',' or an operator before ", Quoted(line.Text(i))));
}

// `x = a b`
CCause SideBySide(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.EndsOperand(i - 1) || !(line.BeginsOperand(i) || line.IsKeyword(i)) || line.IsInBrackets(i))
        return {};
    const bool is_header =
        line.IsKeyword(0) && line.FindBack(0, i, kTokenId_COLON) < 0 && line.Takes(kTokenId_COLON);
    return line.Problem(ECode::kSideBySide, i, i,
                        Joined("expected an operator or ",
                               is_header       ? "':'"
                               : line.IsHint() ? "the end of the hint"
                                               : "the end of the statement",
                               " before ", Quoted(line.Text(i))));
}

CCause MissingExpression(const CFaultyLine& line) {
    const int i = line.At();
    if (line.EndsOperand(i - 1) || !line.Takes(kAnyName)) return {};
    const bool is_name = i > 0 && !line.Takes(kTokenId_NUMBER);
    return line.Problem(ECode::kMissingExpression, line.IsAtEnd() ? i - 1 : i, i,
                        Joined(is_name ? "expected a name " : "expected an expression ", PlaceOf(line)));
}

CCause MissingToken(const CFaultyLine& line) {
    constexpr auto kTokens =
        std::to_array<CInventedToken>({EWord::kImport, EWord::kIn, EWord::kAs, kTokenId_EQUAL, kTokenId_COLON,
                                       kTokenId_LPAR, kTokenId_RPAR, kTokenId_RSQB, kTokenId_RBRACE});
    constexpr auto kTexts =
        std::to_array<std::string_view>({"import", "in", "as", "=", ":", "(", ")", "]", "}"});
    for (size_t token_i = 0; token_i < kTokens.size(); ++token_i)
        if (line.IsSoundWith({line.At(), 0, {kTokens[token_i]}}))
            return line.Problem(ECode::kMissingToken, line.IsAtEnd() ? line.At() - 1 : line.At(), line.At(),
                                Joined("expected ", Quoted(kTexts[token_i]), " ", PlaceOf(line)));
    return {};
}

CProblem Unexpected(const CFaultyLine& line) {
    const int i = line.At();
    if (line.IsAtEnd())
        return line.Problem(ECode::kInvalidSyntax, i, i, "invalid syntax: the line ends too early");
    std::string message = Joined("invalid syntax: unexpected ", Quoted(line.Text(i)));
    if (i > 0) message += Joined(" after ", Quoted(line.Text(i - 1)));
    return line.Problem(ECode::kInvalidSyntax, i, i, std::move(message));
}

}  // namespace codeloom
