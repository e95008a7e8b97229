// The code of each problem: tokens and encoding 1xx, grammar 2xx, blocks and placement 3xx, targets and
// arguments 4xx, scopes 5xx, hints 6xx, versions 7xx, limits 9xx. A code that has been released keeps its
// meaning.
#pragma once

#include <cstdint>

namespace codeloom {

enum class ECode : uint16_t {
    kUnreadable = 101,
    kBackslashAtEnd = 111,
    kInvalidCharacter = 102,
    kAfterBackslash = 103,
    kUnterminatedString = 104,
    kUnterminatedTriple = 105,
    kUnknownPrefix = 106,
    kBytesNotAscii = 121,
    kMixedBytesAndText = 122,
    kInvalidEscape = 123,
    kNumberRunsOn = 131,

    kInvalidNumber = 132,
    kLeadingZeros = 133,
    kFieldNotClosed = 141,
    kEmptyField = 142,
    kSingleBrace = 143,
    kInvalidConversion = 144,
    kFieldExpression = 145,

    kInvalidSyntax = 201,
    kNeverClosed = 202,
    kUnmatchedCloser = 203,
    kMismatchedCloser = 204,
    kMissingComma = 211,
    kMissingColon = 212,
    kMissingElse = 213,
    kMissingIn = 214,
    kMissingParenthesis = 215,
    kMissingName = 216,
    kMissingExpression = 217,
    kMissingToken = 218,
    kSideBySide = 219,
    kAssignmentForComparison = 221,
    kWalrusStatement = 222,
    kForeignSign = 223,
    kSplitOperator = 224,
    kNotAfterOperator = 225,
    kMisspelled = 231,
    kKeywordAsName = 232,
    kStatementInExpression = 233,
    kNestedHeader = 234,
    kDoubled = 235,
    kForeignText = 236,
    kConflictMarker = 237,
    kCallWithoutParentheses = 241,
    kEndedStatement = 242,
    kMissingNames = 251,
    kTrailingComma = 252,
    kImportFrom = 253,
    kDottedName = 254,
    kMissingExceptTypes = 261,
    kUnparenthesizedTypes = 262,
    kDictionaryEntry = 263,
    kComprehensionTarget = 264,
    kUnpackingInComprehension = 265,
    kMissingArgumentValue = 266,

    kUnexpectedIndent = 301,
    kExpectedBlock = 302,
    kUnknownDedent = 303,
    kMixedTabs = 304,
    kClauseWithoutStatement = 305,
    kTryWithoutHandler = 306,
    kBareExceptNotLast = 307,
    kMixedExceptKinds = 308,
    kCaseOutsideMatch = 309,
    kStatementInMatch = 310,
    kDecoratorWithoutDefinition = 311,
    kOutsideFunction = 321,
    kOutsideAsyncFunction = 322,
    kYieldFromInAsync = 323,
    kReturnInAsyncGenerator = 324,
    kOutsideLoop = 325,
    kContinueInFinally = 326,
    kJumpOutOfExceptStar = 327,
    kImportStarNotInModule = 328,
    kFutureNotFirst = 329,
    kUnknownFeature = 330,
    kNonlocalInModule = 331,
    kLazyImportPlaced = 332,
    kJumpOutOfFinally = 333,

    kCannotAssign = 401,
    kCannotDelete = 402,
    kCannotAugment = 403,
    kCannotAnnotate = 404,
    kCannotBindName = 405,
    kMultipleStars = 406,
    kMisplacedStar = 407,
    kWalrusTarget = 408,
    kRepeatedKeyword = 421,
    kMisplacedArgument = 422,
    kBareGenerator = 423,
    kKeywordIsExpression = 424,
    kRepeatedParameter = 431,
    kRepeatedTypeParameter = 432,
    kTypeParameterOrder = 433,
    kTypeParameterBound = 434,
    kNotInTypeExpression = 435,
    kParameterOrder = 436,
    kMisplacedSlash = 437,
    kParenthesizedParameter = 438,
    kMissingDefault = 439,
    kWalrusInIterable = 441,
    kWalrusRebinds = 442,
    kWalrusInClassComprehension = 443,
    kYieldInComprehension = 444,
    kRepeatedPatternName = 451,
    kPatternsUnreachable = 452,
    kPatternNamesDiffer = 453,
    kRepeatedPatternKey = 454,
    kRepeatedPatternAttribute = 455,
    kMisplacedPattern = 456,
    kPatternNotConstant = 457,

    kDeclaredParameter = 501,
    kDeclaredAfterUse = 502,
    kDeclaredAnnotated = 503,
    kNonlocalAndGlobal = 504,
    kNonlocalWithoutBinding = 505,
    kNonlocalTypeParameter = 506,

    kInvalidHint = 601,

    kNewerForm = 701,
    kEndedForm = 702,

    kTooManyIndents = 901,
    kLineTooLong = 902,
    kTooManyBlocks = 903,
    kTooManyParentheses = 904,
    kFieldsTooDeep = 905,
};

// What an interpreter takes: a bad hint in a comment or in quotes, what it only warns of, and what is too
// long for us.
constexpr bool IsWarning(ECode code) {
    return code == ECode::kInvalidHint || code == ECode::kJumpOutOfFinally || code == ECode::kLineTooLong;
}

// A statement or an expression where it isn't allowed.
constexpr bool IsPlacement(ECode code) {
    return code >= ECode::kOutsideFunction && code <= ECode::kJumpOutOfFinally;
}

}  // namespace codeloom
