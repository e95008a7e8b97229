#include "causes/causes.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <optional>

#include "causes/recognisers.h"
#include "line/fault_words.h"
#include "syntax/forms.h"

namespace codeloom {

namespace {

using CRecogniser = CCause (*)(const CFaultyLine& line);
using CTokenRecogniser = CCause (*)(const CFaultyLine& line, int token_i);

// What may be wrong with a token by itself.
constexpr auto kTokenCauses = std::to_array<CTokenRecogniser>(
    {UnterminatedString, UnknownPrefix, AfterBackslash, ForeignSign, InvalidNumber, InvalidCharacter});

// What may be wrong where the parser stopped, in the order in which it is asked: what is certain comes before
// what is likely, and what fits one statement before what fits all.
constexpr auto kGrammarCauses = std::to_array<CRecogniser>({
    UnfinishedField,
    EmptyField,
    Conversion,
    QuoteInString,
    Backquotes,
    UnmatchedCloser,
    CallWithoutParentheses,
    RaiseWithComma,
    Doubled,
    ParameterFault,
    NeverClosed,
    ImportFault,
    ExceptFault,
    ElseIf,
    AsyncAlone,
    ThenForColon,
    CountingLoop,
    DefinitionHead,
    NestedHeader,
    MissingColon,
    PatternFault,
    NotAfterOperator,
    Increment,
    NotIs,
    SplitOperator,
    NewObject,
    Declaration,
    DeclaresAndAssigns,
    ArgumentFault,
    AssignmentForComparison,
    WalrusStatement,
    DictionaryFault,
    ComprehensionFault,
    MissingIn,
    MissingElse,
    FieldExpression,
    StarHere,
    YieldHere,
    Misspelled,
    KeywordAsName,
    StatementInExpression,
    LambdaFault,
    MissingComma,
    StillOpen,
    LaterUnmatchedCloser,
    SemicolonForComma,
    ElseOfCondition,
    LongSlice,
    AfterStatement,
    SideBySide,
    MissingExpression,
    MissingToken,
    EndOfField,
});

CCause TokenCause(const CFaultyLine& line, int token_i) {
    for (const CTokenRecogniser recogniser : kTokenCauses)
        if (CCause cause = recogniser(line, token_i)) return cause;
    return {};
}

// A sign that belongs to no token of the language ends what the parser can judge.
CCause LaterTokenCause(const CFaultyLine& line) {
    for (int i = line.At() + 1; i < line.Count(); ++i)
        if (line.Is(i, kTokenId_ERRORTOKEN))
            if (CCause cause = TokenCause(line, i)) return cause;
    return {};
}

CProblem CauseOfSyntax(const CFaultyLine& line) {
    for (const CRecogniser recogniser : {ConflictMarker, ForeignText})
        if (CCause cause = recogniser(line)) return *cause;
    const bool is_conversion = line.IsField() && line.Text(line.At()) == "!";
    if (!is_conversion)
        if (CCause cause = TokenCause(line, line.At())) return *cause;
    for (const CRecogniser recogniser : kGrammarCauses)
        if (CCause cause = recogniser(line)) return *cause;
    if (CCause cause = LaterTokenCause(line)) return *cause;
    return Unexpected(line);
}

// How another version writes it.
std::string HintFor(const CForm& form, const CFaultyLine& line) {
    const std::string_view text = line.Text(line.At());
    if (&form == &forms::kBareExcept)
        return "write 'except (A, B)'; 'except A, name' of Python 2 is 'except A as name'";
    if (&form == &forms::kOldOctal)
        return Joined("write 0o", text.substr(std::min(text.find_first_not_of("0_"), text.size() - 1)));
    if (&form == &forms::kLongNumber) return Joined("write ", text.substr(0, text.size() - 1));
    return {};
}

bool IsHint(const CFault& fault, ELogicalType part) {
    return fault.kind == EFault::kInvalidHint || part == ELogicalType::kStringifiedTypeHint ||
           part == ELogicalType::kCommentedTypeHint;
}

//   (int, str) -> int    a function's hint has two sides, each an expression; `place` is on one of them
CRawLogical SideOfArrow(const CRawLogical& hint, uint32_t place) {
    CRawLogical side = hint;
    int depth = 0;
    for (size_t i = 0; i < hint.tokens.size(); ++i) {
        const CRawToken& token = hint.tokens[i];
        depth += IsOpenerType(token.type) - IsCloserType(token.type);
        if (depth != 0 || token.word != EWord::kArrow) continue;
        const auto arrow = side.tokens.begin() + static_cast<ptrdiff_t>(i);
        if (place > token.start) {
            side.tokens.erase(side.tokens.begin(), arrow + 1);
        } else {
            side.tokens.erase(arrow, side.tokens.end());
        }
        break;
    }
    return side;
}

// The hint as a line of its own, which has its tokens and its fault; none where only the whole shows it.
std::optional<CProblem> CauseWithin(const CSpan& place, const CRawLogical& line, const CFaultyLine& faulty,
                                    CLineProbe& probe) {
    if (faulty.LineType() == ELogicalType::kStringifiedTypeHint) return CauseOfSyntax(faulty);
    for (const CRawLogical& part : line.embedded) {
        const bool is_meant = part.type == ELogicalType::kCommentedTypeHint && !part.tokens.empty() &&
                              part.EndOf(part.tokens.back()) >= place.start;
        if (!is_meant) continue;
        const CRawLogical side = SideOfArrow(part, place.start);
        const int token_i = side.tokens.empty() ? CLineProbe::kSound : probe.FaultWith(side, false, {});
        if (token_i == CLineProbe::kSound) return {};
        return CauseOfSyntax({line, side, static_cast<uint32_t>(token_i), faulty.Language(), probe});
    }
    return {};
}

CProblem CauseOfHint(const CFault& fault, const CRawLogical& line, const CFaultyLine& faulty,
                     CLineProbe& probe) {
    const CSpan place = PlaceOf(fault, line);
    std::optional<CProblem> cause = CauseWithin(place, line, faulty, probe);
    if (!cause) {
        cause = faulty.Problem(ECode::kInvalidHint, faulty.At(), faulty.At(), "invalid syntax");
        if (place.start < place.end) {
            cause->start = place.start;
            cause->end = place.end;
        }
    }
    cause->code = ECode::kInvalidHint;
    cause->message.insert(0, "type hint: ");
    return *cause;
}

}  // namespace

CCauses::CCauses(const CLanguage& language) : _fLanguage(language) {}

CCauses::~CCauses() = default;

CProblem CCauses::Of(const CFault& fault, const CRawLogical& line) {
    assert(fault && fault.kind != EFault::kTooLong);
    if (_fProbe == nullptr) _fProbe = std::make_unique<CLineProbe>(_fLanguage);
    const CRawLogical& part = PartAtFault(fault, line);
    const CFaultyLine faulty(line, part, fault.token_i, _fLanguage, *_fProbe);
    const int at = faulty.At();
    if (IsHint(fault, part.type)) return CauseOfHint(fault, line, faulty, *_fProbe);
    switch (fault.kind) {
        case EFault::kNewerForm:
            return faulty.Problem(fault.form->version == CForm::kNone ? ECode::kEndedForm : ECode::kNewerForm,
                                  at, at, MessageOf(fault, line), HintFor(*fault.form, faulty));
        case EFault::kBareGenerator:
            return faulty.Problem(ECode::kBareGenerator, at, at,
                                  "Generator expression must be parenthesized");
        default:
            return CauseOfSyntax(faulty);
    }
}

}  // namespace codeloom
