// Forms of other languages that are nearly Python: `var x = 1`, `new A()`, `if a then:`.

#include <algorithm>
#include <array>

#include "causes/recognisers.h"

namespace codeloom {

namespace {

// Words that other languages begin a declaration with.
constexpr auto kDeclaring = std::to_array<std::string_view>(
    {"var",    "let",     "const",     "val",    "int",    "long", "float", "double",
     "char",   "bool",    "boolean",   "string", "String", "auto", "final", "static",
     "public", "private", "protected", "void",   "my",     "dim",  "local"});

CProblem LeftOut(const CFaultyLine& line, int i) {
    return line.Problem(ECode::kMisspelled, i, i, Joined(Quoted(line.Text(i)), " isn't a keyword in Python"),
                        "leave it out");
}

}  // namespace

// `var x = 1`, `int x = 1`
CCause Declaration(const CFaultyLine& line) {
    if (line.At() != 1 || !line.IsName(0) || !(line.IsName(1) || line.IsKeyword(1))) return {};
    const bool is_known = std::find(kDeclaring.begin(), kDeclaring.end(), line.Text(0)) != kDeclaring.end();
    if (!is_known || line.FaultWith({0, 1, {}}) < 2) return {};
    return LeftOut(line, 0);
}

// `x = new A()`
CCause NewObject(const CFaultyLine& line) {
    const int i = line.At() - 1;
    if (i < 0 || line.Text(i) != "new" || !line.IsName(i + 1) || line.FaultWith({i, 1, {}}) < i + 1)
        return {};
    return LeftOut(line, i);
}

// `if a then:`, `while a do`
CCause ThenForColon(const CFaultyLine& line) {
    const int i = line.At();
    if (line.Text(i) != "then" && line.Text(i) != "do") return {};
    const bool has_colon = line.Is(i + 1, kTokenId_COLON);
    if (!line.IsSoundWith({i, has_colon ? 2 : 1, {kTokenId_COLON}})) return {};
    return line.Problem(ECode::kMissingColon, i, i, "expected ':'",
                        Joined("write ':' instead of ", Quoted(line.Text(i))));
}

// `for (i = 0; i < 9; i++) {`
CCause CountingLoop(const CFaultyLine& line) {
    const int i = line.At();
    const bool is_loop = line.Is(0, EWord::kFor) && line.Is(1, kTokenId_LPAR) && line.OpenerBefore(i) == 1;
    if (!is_loop || !line.Is(i, kTokenId_EQUAL)) return {};
    return line.Problem(ECode::kMissingIn, 0, i, "'in' expected after for-loop variables",
                        "write 'for i in range(...):' to count");
}

// `a not is b`
CCause NotIs(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, EWord::kIs) || !line.Is(i - 1, EWord::kNot)) return {};
    if (!line.IsSoundWith({i - 1, 2, {EWord::kIs, EWord::kNot}})) return {};
    return line.Problem(ECode::kMisspelled, i - 1, i, "invalid syntax. Did you mean 'is not'?",
                        "write 'is not' instead of 'not is'");
}

// `x = 5:`, `pass x`
CCause AfterStatement(const CFaultyLine& line) {
    const int i = line.At();
    const bool is_colon = line.Is(i, kTokenId_COLON) && !line.IsInBrackets(i) && line.EndsOperand(i - 1);
    const bool is_last = i + 1 == line.Count();
    const bool is_whole =
        i - 1 == line.StatementStart(i) &&
        (line.Is(i - 1, EWord::kPass) || line.Is(i - 1, EWord::kBreak) || line.Is(i - 1, EWord::kContinue));
    if (!is_whole && !(is_colon && (line.IsSoundWith({i, 1, {}}) || !is_last))) return {};
    return line.Problem(ECode::kSideBySide, i, i,
                        Joined("expected the end of the statement before ", Quoted(line.Text(i))),
                        is_colon && is_last ? "only the header of a block ends with ':'" : "");
}

// `f(a; b)`
CCause SemicolonForComma(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, kTokenId_SEMI) || !line.IsSoundWith({i, 1, {kTokenId_COMMA}})) return {};
    return line.Problem(ECode::kMissingComma, i, i, "invalid syntax. Perhaps you forgot a comma?",
                        "write ',' instead of ';'");
}

// `[a for a in b if c else d]`
CCause ElseOfCondition(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i, EWord::kElse) || line.FindBack(line.OpenerBefore(i) + 1, i, EWord::kFor) < 0) return {};
    return line.Problem(ECode::kInvalidSyntax, i, i, "the condition of a comprehension has no 'else'",
                        "write 'a if b else c' before 'for'");
}

// `a[1:2:3:4]`
CCause LongSlice(const CFaultyLine& line) {
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    const bool is_index = line.Is(opener_i, kTokenId_LSQB) && line.FollowsOperand(opener_i);
    if (!is_index || !line.Is(i, kTokenId_COLON)) return {};
    return line.Problem(ECode::kInvalidSyntax, i, i, "a slice has three parts at most");
}

// `global x = 5`
CCause DeclaresAndAssigns(const CFaultyLine& line) {
    const int i = line.At();
    const bool declares = line.Is(0, EWord::kGlobal) || line.Is(0, EWord::kNonlocal);
    if (!declares || !line.Is(i, kTokenId_EQUAL)) return {};
    return line.Problem(ECode::kSideBySide, i, i, "expected the end of the statement before '='",
                        Joined(Quoted(line.Text(0)), " only names: assign on a row of its own"));
}

}  // namespace codeloom
