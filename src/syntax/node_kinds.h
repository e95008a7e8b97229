// The kinds of tree nodes, which are the node classes of the engine by number. A kind and its subclasses are
// neighbours in the list, so that a question of class is a comparison of numbers.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace codeloom {

// KIND(enumerator, class name, last kind derived from it)
#define CODELOOM_NODE_KINDS(KIND)                                                   \
    KIND(kNode, "CNode", kClassPattern)                                             \
    KIND(kExpression, "CExpression", kStringLiteral)                                \
    KIND(kIfElse, "CIfElseExpression", kIfElse)                                     \
    KIND(kOperators, "COperatorExpression", kOperators)                             \
    KIND(kStar, "CStarExpression", kStar)                                           \
    KIND(kDottedName, "CDottedName", kDottedName)                                   \
    KIND(kLambda, "CLambdaExpr", kLambda)                                           \
    KIND(kYield, "CYieldExpr", kYield)                                              \
    KIND(kTestList, "CTestListStarExpr", kTestList)                                 \
    KIND(kAtomExpr, "CAtomExpr", kAtomExpr)                                         \
    KIND(kPower, "CPower", kPower)                                                  \
    KIND(kFactor, "CFactorExpr", kFactor)                                           \
    KIND(kNamedExpr, "CNamedExpr", kNamedExpr)                                      \
    KIND(kAtom, "CAtom", kAtom)                                                     \
    KIND(kNameLiteral, "CNameLiteral", kNameLiteral)                                \
    KIND(kKeywordLiteral, "CKeywordLiteral", kKeywordLiteral)                       \
    KIND(kNumberLiteral, "CNumberLiteral", kNumberLiteral)                          \
    KIND(kStringLiteral, "CStringLiteral", kStringLiteral)                          \
    KIND(kYieldArg, "CYieldArg", kYieldArg)                                         \
    KIND(kCompFor, "CCompForNode", kCompFor)                                        \
    KIND(kListmaker, "CListmakerNode", kListmaker)                                  \
    KIND(kTrailer, "CTrailer", kTrailer)                                            \
    KIND(kImportNames, "CImportNamesStmt", kImportNames)                            \
    KIND(kFromImport, "CFromImportStmt", kFromImport)                               \
    KIND(kUsedArgument, "CSingleUsedArgumentNode", kUsedArgument)                   \
    KIND(kParameterDef, "CFunctionParameterDef", kParameterDef)                     \
    KIND(kDefiningArglist, "CDefiningArglistNode", kDefiningArglist)                \
    KIND(kUsedArglist, "CUsedArglistNode", kUsedArglist)                            \
    KIND(kParameters, "CParametersNode", kParameters)                               \
    KIND(kStmt, "CStmt", kWithTypeParameters)                                       \
    KIND(kClassdef, "CClassdefStmt", kClassdef)                                     \
    KIND(kFuncdef, "CFuncdefStmt", kFuncdef)                                        \
    KIND(kIf, "CIfStmt", kIf)                                                       \
    KIND(kMatch, "CMatchStmt", kMatch)                                              \
    KIND(kCase, "CCaseStmt", kCase)                                                 \
    KIND(kDel, "CDelStmt", kDel)                                                    \
    KIND(kGlobal, "CGlobalStmt", kGlobal)                                           \
    KIND(kNonlocal, "CNonlocalStmt", kNonlocal)                                     \
    KIND(kFor, "CForStmt", kFor)                                                    \
    KIND(kWith, "CWithStmt", kWith)                                                 \
    KIND(kPass, "CPassStmt", kPass)                                                 \
    KIND(kExprStmt, "CExprStmt", kExprStmt)                                         \
    KIND(kReturn, "CReturnStmt", kReturn)                                           \
    KIND(kWithTypeParameters, "CWithTypeParameters", kWithTypeParameters)           \
    KIND(kWithItem, "CWithItem", kWithItem)                                         \
    KIND(kAnnotatedAssign, "CAnnotatedAssignNode", kAnnotatedAssign)                \
    KIND(kSingleDecorator, "CSingleDecorator", kSingleDecorator)                    \
    KIND(kMultipleDecorators, "CMultipleDecorators", kMultipleDecorators)           \
    KIND(kExceptClause, "CExceptClause", kExceptClause)                             \
    KIND(kTypeParameter, "CTypeParameter", kTypeParameter)                          \
    KIND(kPattern, "CPatternNode", kClassPattern)                                   \
    KIND(kSequencePattern, "CSequencePatternNode", kSequencePattern)                \
    KIND(kMappingPattern, "CMappingPatternNode", kMappingPattern)                   \
    KIND(kClassArgumentPattern, "CClassArgumentPatternNode", kClassArgumentPattern) \
    KIND(kClassPattern, "CClassPatternNode", kClassPattern)

enum class ENodeKind : uint8_t {
#define CODELOOM_NODE_KIND_ENUM(name, class_name, last) name,
    CODELOOM_NODE_KINDS(CODELOOM_NODE_KIND_ENUM)
#undef CODELOOM_NODE_KIND_ENUM
        kCount
};

struct CNodeKindRow {
    std::string_view class_name;
    ENodeKind last_derived;
};

#define CODELOOM_NODE_KIND_ROW(name, class_name, last) CNodeKindRow{class_name, ENodeKind::last},
inline constexpr auto kNodeKinds = std::to_array<CNodeKindRow>({CODELOOM_NODE_KINDS(CODELOOM_NODE_KIND_ROW)});
#undef CODELOOM_NODE_KIND_ROW

// True when `kind` is `base` or derived from it.
constexpr bool IsKind(ENodeKind kind, ENodeKind base) {
    return kind >= base && kind <= kNodeKinds[static_cast<size_t>(base)].last_derived;
}

}  // namespace codeloom
