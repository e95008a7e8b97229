// The forms of the language that not every version has.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace codeloom {

struct CForm {
    static constexpr int kNone = INT32_MAX;

    const char* name;
    int version;  // the first that has it, 312 for 3.12; kNone for what ended with Python 2
};

namespace forms {

inline constexpr CForm kUnicodeName{"a name with other than ASCII letters", 300};
inline constexpr CForm kUnicodePrefix{"the prefix `u` of a string", 303};
inline constexpr CForm kRawBytes{"the prefix `rb` of bytes", 303};
inline constexpr CForm kYieldFrom{"`yield from`", 303};
inline constexpr CForm kReturnInGenerator{"a value returned by a generator", 303};
inline constexpr CForm kAsync{"`async`", 305};
inline constexpr CForm kMatrixProduct{"`@` as an operator", 305};
inline constexpr CForm kUnpackingInCall{"unpacking in a call anywhere but once at the end", 305};
inline constexpr CForm kUnpackingInDisplay{"unpacking in a display or a value", 305};
inline constexpr CForm kFString{"an f-string", 306};
inline constexpr CForm kUnderscore{"`_` within a number", 306};
inline constexpr CForm kAsyncComprehension{"an asynchronous comprehension", 306};
inline constexpr CForm kCommaAfterStars{"a comma after starred parameters", 306};
inline constexpr CForm kEmptyTarget{"`()` as a target", 306};
inline constexpr CForm kVariableAnnotation{"an annotation of a variable", 306};
inline constexpr CForm kWalrus{"`:=`", 308};
inline constexpr CForm kStarInResult{"a starred expression without parentheses after `return` or `yield`",
                                     308};
inline constexpr CForm kAnnotatedTuple{"an annotated assignment of a bare tuple or `yield`", 308};
inline constexpr CForm kSignOfField{"`=` at the end of a field of an f-string", 308};
inline constexpr CForm kPositionalOnly{"`/` among parameters", 308};
inline constexpr CForm kDecorator{"a decorator that isn't a name or a call of one", 309};
inline constexpr CForm kWithBrackets{"a `with` whose items are in parentheses", 309};
inline constexpr CForm kStarInFor{"a starred expression in the list of a `for`", 309};
inline constexpr CForm kWalrusInSet{"`:=` without its own parentheses in a set", 309};
inline constexpr CForm kMatch{"`match`", 310};
inline constexpr CForm kCase{"`case`", 310};
inline constexpr CForm kWalrusInSubscript{"`:=` without its own parentheses in a subscript", 310};
inline constexpr CForm kExceptStar{"`except*`", 311};
inline constexpr CForm kStarInSubscript{"a starred expression in a subscript", 311};
inline constexpr CForm kStarredAnnotation{"a starred annotation", 311};
inline constexpr CForm kTypeAlias{"`type`", 312};
inline constexpr CForm kTypeParameters{"a list of type parameters", 312};
inline constexpr CForm kQuotesInField{"an f-string's own quotes or row ends in its field", 312};
inline constexpr CForm kBackslashInField{"a backslash in a field of an f-string", 312};
inline constexpr CForm kCommentInField{"`#` in a field of an f-string", 312};
inline constexpr CForm kTypeDefault{"a default of a type parameter", 313};
inline constexpr CForm kBareExcept{"an `except` of several types without parentheses", 314};
inline constexpr CForm kTString{"a t-string", 314};
inline constexpr CForm kLazyImport{"a lazy import", 315};
inline constexpr CForm kUnpackingComprehension{"unpacking in a comprehension", 315};

inline constexpr CForm kOldOctal{"an octal number without `0o`", CForm::kNone};
inline constexpr CForm kLongNumber{"the suffix `L` of a number", CForm::kNone};
inline constexpr CForm kRawUnicode{"the prefix `ur` of a string", CForm::kNone};

}  // namespace forms

// "`type` needs Python 3.12", "the suffix `L` of a number ended with Python 2"
std::string MessageOf(const CForm& form);

// The form that the text of a string literal has; null for one that has always been.
const CForm* FormOfString(std::string_view text);

// The form that the text of a number has; null for one that every version has.
const CForm* FormOfNumber(std::string_view text);

}  // namespace codeloom
