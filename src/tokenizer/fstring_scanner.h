// The fields of f-strings and t-strings: `{expression = !conversion : format spec}`, where the expression may
// hold strings of any quotes, further f-strings and rows of its own, and the format spec further fields.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "tokenizer/string_lexer.h"

namespace codeloom {

class CLexer;
struct CLexedToken;

// Takes fields and their tokens while a string is scanned. Fields nest: a field that begins before
// another one has ended lies in a string inside that one's expression, or in its format spec.
class CFieldListener {
  public:
    virtual void BeginField(size_t brace_pos) = 0;
    // A token of the innermost field that is open. A nested string comes after its own fields.
    virtual void AddFieldToken(size_t pos, const CLexedToken& token) = 0;
    // The innermost field's expression ends at `pos`, on "!", ":" or "}". It is sound if that, and what
    // follows it up to the format spec, is sound.
    virtual void EndExpression(size_t pos, bool is_sound) = 0;
    // The innermost field is closed.
    virtual void EndField() = 0;
    // A "}" that closes nothing.
    virtual void AddLoneBrace(size_t pos) = 0;

  protected:
    ~CFieldListener() = default;
};

// Nothing here calls itself: what is open is on a stack of its own, so that nesting of the text costs no
// call depth.
class CFstringScanner {
  public:
    // For one scan. `listener` may be null. `depth` counts the fields around the string.
    CFstringScanner(CLexer& lexer, CFieldListener* listener, int depth)
        : _fLexer(lexer), _fListener(listener), _fDepth(depth) {}

    // Scans the string whose content begins at `pos`. Not closed when the fields don't let the closing quotes
    // be reached; `end` is then the place where scanning was given up.
    CStringEnd Scan(size_t pos, const CStringStart& start);

  private:
    enum class EPart : uint8_t { kString, kExpression, kFormatSpec };

    // Something that has begun and not yet ended.
    struct CPart {
        EPart kind;
        CStringStart string;        // itself, or the one around the field
        size_t start = 0;           // of a string
        size_t outer_brackets = 0;  // of an expression: those that were open before it
    };

    static constexpr size_t kFailed = SIZE_MAX;

    // Each of these takes a position, and returns one further on, or kFailed. The first two go on to where
    // another part begins, or the innermost one ends.
    size_t _ScanLiteral(size_t pos);
    size_t _ScanExpression(size_t pos);
    size_t _BeginField(size_t brace_pos);
    size_t _EndExpression(size_t pos);
    size_t _EndField(size_t brace_pos);
    size_t _EndString(size_t end);
    size_t _ScanFieldToken(size_t pos);
    size_t _ScanDebugSign(size_t pos);
    size_t _ScanConversion(size_t pos, bool& is_sound);
    size_t _SkipLiteralEscape(size_t pos, const CStringStart& string) const;
    size_t _SkipToToken(size_t pos);

    bool _IsExpressionEndAt(size_t pos) const;
    size_t _FailAt(size_t pos);

    CLexer& _fLexer;
    CFieldListener* _fListener;
    int _fDepth;
    size_t _fFailedAt = 0;
    std::vector<CPart> _fParts;    // the innermost last
    std::vector<char> _fBrackets;  // open in the expressions, a closer for each
};

}  // namespace codeloom
