// The logical types: what kind of line a logical line is. One list serves the enum, the names that the host
// imports and their text values.
#pragma once

#include <cstdint>

namespace codeloom {

#define CODELOOM_LOGICAL_TYPES(TYPE)                    \
    TYPE(kUnknown, "unknown")                           \
    TYPE(kClassDef, "class")                            \
    TYPE(kFunctionDef, "def")                           \
    TYPE(kStringExpression, "string expression")        \
    TYPE(kAssignment, "assignment")                     \
    TYPE(kIfBeginning, "if")                            \
    TYPE(kElseBeginning, "else")                        \
    TYPE(kWhileBeginning, "while")                      \
    TYPE(kForBeginning, "for")                          \
    TYPE(kPass, "pass")                                 \
    TYPE(kRaise, "raise")                               \
    TYPE(kTry, "try")                                   \
    TYPE(kExcept, "except")                             \
    TYPE(kFinally, "finally")                           \
    TYPE(kAssert, "assert")                             \
    TYPE(kReturn, "return")                             \
    TYPE(kImport, "import")                             \
    TYPE(kFromImport, "from import")                    \
    TYPE(kPrint, "print")                               \
    TYPE(kDelete, "del")                                \
    TYPE(kElifBeginning, "elif")                        \
    TYPE(kComment, "comment")                           \
    TYPE(kBlankLine, "blank line")                      \
    TYPE(kBreak, "break")                               \
    TYPE(kContinue, "continue")                         \
    TYPE(kWith, "with")                                 \
    TYPE(kMatch, "match")                               \
    TYPE(kCase, "case")                                 \
    TYPE(kFstringFieldExp, "f-string field")            \
    TYPE(kCommentedTypeHint, "commented type hint")     \
    TYPE(kStringifiedTypeHint, "stringified type hint") \
    TYPE(kTypeStatement, "type")                        \
    TYPE(kErrorTokenPrefix, "error token")

enum class ELogicalType : uint8_t {
#define CODELOOM_LOGICAL_TYPE_ENUM(name, text) name,
    CODELOOM_LOGICAL_TYPES(CODELOOM_LOGICAL_TYPE_ENUM)
#undef CODELOOM_LOGICAL_TYPE_ENUM
};

}  // namespace codeloom
