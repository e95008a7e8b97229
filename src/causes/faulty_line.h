// A line with a fault, as the recognisers see it: its tokens without comments, and the place where the parser
// stopped.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "causes/line_probe.h"
#include "rules/problem.h"
#include "rules/rule_context.h"
#include "syntax/fault.h"
#include "syntax/language.h"
#include "text/words.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CFaultyLine {
  public:
    // `part` is the line, or what is embedded in it, and the token is of that part.
    CFaultyLine(const CRawLogical& line, const CRawLogical& part, uint32_t token_i, const CLanguage& language,
                CLineProbe& probe);

    const CLanguage& Language() const { return _fLanguage; }
    std::string_view FileText() const { return _fPart.file_text; }
    ELogicalType LineType() const { return _fPart.type; }
    // In braces of an f-string or a t-string; `Outer` is the line that holds the string.
    bool IsField() const { return _fPart.type == ELogicalType::kFstringFieldExp; }
    const CRawLogical& Outer() const { return _fOuter; }
    // In quotes or in a comment.
    bool IsHint() const {
        return LineType() == ELogicalType::kStringifiedTypeHint ||
               LineType() == ELogicalType::kCommentedTypeHint;
    }

    // Indexes of tokens. At is Count where the line ends too early.
    int At() const { return _fAt; }
    int Count() const { return static_cast<int>(_fPart.tokens.size()); }
    bool IsAtEnd() const { return _fAt >= Count(); }

    // Before the first token and after the last one there is the end marker, with an empty text.
    const CRawToken& Token(int i) const;
    int Type(int i) const { return Token(i).type; }
    EWord Word(int i) const { return Token(i).word; }
    std::string_view Text(int i) const { return TextOf(Token(i), _fPart.file_text); }
    bool Is(int i, int type) const { return Type(i) == type; }
    bool Is(int i, EWord word) const { return Word(i) == word; }
    bool IsKeyword(int i) const;
    bool IsName(int i) const { return Is(i, kTokenId_NAME) && !IsKeyword(i); }
    // The token follows the one before it without a blank.
    bool IsAdjacent(int i) const;
    bool IsOnNextRow(int i) const;
    // It may be the last token of an operand, or the first one.
    bool EndsOperand(int i) const;
    bool BeginsOperand(int i) const;

    // The innermost bracket open before the token; -1 where there is none.
    int OpenerBefore(int i) const;
    // The bracket that closes the one at `opener_i`; Count where there is none.
    int CloserOf(int opener_i) const;
    bool IsInBrackets(int i) const { return IsField() || OpenerBefore(i) >= 0; }
    // The bracket at `opener_i` holds arguments or an index: an operand is before it.
    bool FollowsOperand(int opener_i) const { return EndsOperand(opener_i - 1); }
    // The first token of the operand, with calls and attributes, that the one at `last_i` ends.
    int OperandStart(int last_i) const;
    // The first token after the opener, or after the comma before `i` right in the same brackets.
    int ItemStart(int i) const;
    // The last token of this type, or word, from `from` up to before `to` that isn't in further brackets; -1.
    int FindBack(int from, int to, CInventedToken token) const;
    // The simple statement on the row: after the colon of a header, or the first token.
    int StatementStart(int i) const;

    int FaultWith(const CEdit& edit) const;
    bool IsSoundWith(const CEdit& edit) const { return FaultWith(edit) == CLineProbe::kSound; }
    // The parser would have taken the token where it stopped.
    bool Takes(CInventedToken token) const { return FaultWith({_fAt, 0, {token}}) > _fAt; }

    // A problem that covers the tokens from the first to the last, both included.
    CProblem Problem(ECode code, int first_i, int last_i, std::string message, std::string hint = {}) const;
    CProblem ProblemAt(ECode code, uint32_t start, uint32_t end, std::string message,
                       std::string hint = {}) const;
    CRelated Related(int i, std::string text) const;

  private:
    const CRawLogical& _fOuter;
    CRawLogical _fPart;
    const CLanguage& _fLanguage;
    CLineProbe& _fProbe;
    int _fAt = 0;
};

using CCause = std::optional<CProblem>;

// `+` and what binds like an operator between operands, but no comparison.
bool IsArithmeticSign(int type);

// 'text'; a string as it is, and what is long only as "it".
std::string Quoted(std::string_view text);

}  // namespace codeloom
