// What the patterns of a `case` are made of (PEP 634), by descent into ranges of tokens.
//   in     a step that plans a node, and the tokens of its range
//   out    the steps that make its parts, put down in a plan
// Every step decides by the first token or by a search outside brackets; what doesn't fit fails at its
// token. Parsers of plain and of hosted trees share it.
//
// Tokens has CIndex, CPlan and kNone; Type(i) and Count(); Find(mark, start_i, end_i), the index of a mark
// outside brackets or kNone; IsAs(i); FailAt(i), which doesn't return; and what makes each kind of node:
// kPattern, kSequencePattern, kClassPattern, kClassArgumentPattern, kExpression. Extended patterns take kAtom
// and kFirstAfterWord, the index of the token after `case`, and RefuseKeyword(i), which fails at what can't
// be a name.
#pragma once

#include <cassert>

#include "syntax/pattern_steps.h"
#include "text/token_type.h"

namespace codeloom {

// An operator that separates the parts of a pattern, by number and as text.
struct CPatternMark {
    int type;
    const char* text;
};

namespace pattern_mark {

inline constexpr CPatternMark kBar{kTokenId_VBAR, "|"};
inline constexpr CPatternMark kColon{kTokenId_COLON, ":"};
inline constexpr CPatternMark kComma{kTokenId_COMMA, ","};
inline constexpr CPatternMark kEqual{kTokenId_EQUAL, "="};
inline constexpr CPatternMark kOpening{kTokenId_LPAR, "("};

}  // namespace pattern_mark

template <class Tokens>
class TCasePatternPlans {
  public:
    using Index = typename Tokens::CIndex;
    using CPlan = typename Tokens::CPlan;
    using EKind = EPatternStep;

    explicit TCasePatternPlans(Tokens tokens) : _fTokens(tokens) {}

    // Requires a step that plans a node.
    template <class Step>
    void Plan(CPlan&& plan, const Step& step) {
        switch (step.kind) {
            case EKind::kPattern:
                return _Pattern(plan, step.start_i, step.end_i, step.allow_as);
            case EKind::kClassPattern:
                return _ClassPattern(plan, step.start_i, step.end_i);
            case EKind::kClassArgument:
                return _ClassArgument(plan, step.start_i, step.end_i);
            case EKind::kDottedName:
                return _DottedName(plan, step.start_i, step.end_i);
            case EKind::kNumber:
                return _Number(plan, step.start_i, step.end_i);
            case EKind::kSequence:
                return _Sequence(plan, step.start_i, step.end_i);
            case EKind::kMapping:
                return _Mapping(plan, step.start_i, step.end_i);
            default:
                assert(false);
        }
    }

    // The same for what the step takes in the language as it is and not in the definition of the parser:
    //   case a, *b:    case "a" "b":    case ():
    // False for all other patterns. What the other steps would take wrongly is refused: keywords for names,
    // and a bar at the end.
    template <class Step>
    bool PlanExtended(CPlan&& plan, const Step& step) {
        assert(step.kind == EKind::kPattern);
        const Index start_i = step.start_i, end_i = step.end_i;
        if (start_i + 1 == end_i) _fTokens.RefuseKeyword(start_i);
        if (start_i + 1 < end_i && _fTokens.Type(end_i - 1) == kTokenId_VBAR) _fTokens.FailAt(end_i);
        if (_IsOpenSequence(step)) {
            _Patterns(plan, start_i, end_i);
            plan.Build(Tokens::kSequencePattern);
        } else if (_BeginsWithStrings(step)) {
            _Strings(plan, start_i, end_i);
        } else if (_IsEmptySequence(start_i, end_i)) {
            plan.Part(EKind::kSequence, start_i, end_i);
        } else {
            return false;
        }
        return true;
    }

  private:
    static constexpr Index kNone = Tokens::kNone;

    // The patterns in [start_i, end_i) with the commas between them.
    void _Patterns(CPlan& plan, Index start_i, Index end_i) {
        for (Index i = start_i; i < end_i;) {
            const Index comma_i = _FindOrEnd(pattern_mark::kComma, i, end_i);
            plan.Pattern(i, comma_i);
            if (comma_i != end_i) plan.Token(comma_i);
            i = comma_i + 1;
        }
    }

    bool _IsCapture(Index start_i, Index end_i, bool allow_as) {
        return allow_as && end_i > start_i + 2 && _fTokens.IsAs(end_i - 2);
    }

    // Of the ranges that begin after `case`, the whole pattern is the only one with a comma outside brackets.
    template <class Step>
    bool _IsOpenSequence(const Step& step) {
        return step.start_i == Tokens::kFirstAfterWord && step.allow_as &&
               _Has(pattern_mark::kComma, step.start_i, step.end_i);
    }

    template <class Step>
    bool _BeginsWithStrings(const Step& step) {
        if (step.start_i + 1 >= step.end_i || _fTokens.Type(step.start_i) != kTokenId_STRING) return false;
        return !_IsCapture(step.start_i, step.end_i, step.allow_as) &&
               !_Has(pattern_mark::kBar, step.start_i, step.end_i);
    }

    bool _IsEmptySequence(Index start_i, Index end_i) {
        return start_i + 2 == end_i && _fTokens.Type(start_i) == kTokenId_LPAR &&
               _fTokens.Type(start_i + 1) == kTokenId_RPAR;
    }

    bool _Has(const CPatternMark& mark, Index start_i, Index end_i) {
        return _fTokens.Find(mark, start_i, end_i) != kNone;
    }

    Index _FindOrEnd(const CPatternMark& mark, Index start_i, Index end_i) {
        const Index i = _fTokens.Find(mark, start_i, end_i);
        return i == kNone ? end_i : i;
    }

    bool _IsSign(Index i) const {
        const int type = _fTokens.Type(i);
        return type == kTokenId_PLUS || type == kTokenId_MINUS;
    }

    void _Pattern(CPlan& plan, Index start_i, Index end_i, bool allow_as) {
        const int type = _fTokens.Type(start_i);
        if (_IsCapture(start_i, end_i, allow_as)) return _Capture(plan, start_i, end_i);
        if (_Has(pattern_mark::kBar, start_i, end_i)) return _Alternatives(plan, start_i, end_i);
        if (type == kTokenId_LSQB) return plan.Part(EKind::kSequence, start_i, end_i);
        if (type == kTokenId_LPAR && _Has(pattern_mark::kComma, start_i + 1, end_i))
            return plan.Part(EKind::kSequence, start_i, end_i);
        if (type == kTokenId_LBRACE) return plan.Part(EKind::kMapping, start_i, end_i);
        if (type == kTokenId_LPAR) return _Group(plan, start_i, end_i);
        if (start_i + 1 == end_i) return _SingleToken(plan, start_i);
        if (_IsSign(start_i) || type == kTokenId_NUMBER) return plan.Part(EKind::kNumber, start_i, end_i);
        if (type == kTokenId_NAME && !_Has(pattern_mark::kOpening, start_i + 1, end_i))
            return plan.Part(EKind::kDottedName, start_i, end_i);
        if (type == kTokenId_NAME) return plan.Part(EKind::kClassPattern, start_i, end_i);
        if (type == kTokenId_STAR) return _Star(plan, start_i, end_i);
        _fTokens.FailAt(start_i);
    }

    //   case a | b as c:
    //        ^^^^^^^^^^
    //   a pattern: the pattern, `as`, the name
    void _Capture(CPlan& plan, Index start_i, Index end_i) {
        plan.Pattern(start_i, end_i - 2, false);
        if (_fTokens.Type(end_i - 1) != kTokenId_NAME) plan.Fail(end_i - 1);
        plan.Token(end_i - 2);
        plan.Token(end_i - 1);
        plan.Build(Tokens::kPattern);
    }

    //   case a | b | c:
    //        ^^^^^^^^^
    //   a pattern: the patterns with the bars between them
    void _Alternatives(CPlan& plan, Index start_i, Index end_i) {
        for (Index i = start_i; i < end_i;) {
            const Index bar_i = _FindOrEnd(pattern_mark::kBar, i, end_i);
            plan.Pattern(i, bar_i, false);
            if (bar_i != end_i) plan.Token(bar_i);
            i = bar_i + 1;
        }
        plan.Build(Tokens::kPattern);
    }

    //   case (a | b):
    //        ^^^^^^^
    //   a pattern: `(`, the pattern, `)`
    void _Group(CPlan& plan, Index start_i, Index end_i) {
        plan.Pattern(start_i + 1, end_i - 1);
        if (_fTokens.Type(end_i - 1) != kTokenId_RPAR) plan.Fail(end_i - 1);
        plan.TokenBefore(start_i);
        plan.Token(end_i - 1);
        plan.Build(Tokens::kPattern);
    }

    //   case x:   case _:   case None:   case 1:   case "a":
    //        ^         ^         ^^^^         ^         ^^^
    //   a leaf, with no difference between captures and constants
    void _SingleToken(CPlan& plan, Index i) {
        const int type = _fTokens.Type(i);
        if (type != kTokenId_NAME && type != kTokenId_NUMBER && type != kTokenId_STRING) _fTokens.FailAt(i);
        plan.Token(i);
    }

    //   case [a, *rest]:
    //            ^^^^^
    //   a pattern: `*`, the name
    void _Star(CPlan& plan, Index start_i, Index end_i) {
        const Index name_i = start_i + 1;
        const bool is_named = name_i < _fTokens.Count() && _fTokens.Type(name_i) == kTokenId_NAME;
        if (!is_named || name_i + 1 != end_i) _fTokens.FailAt(start_i);
        plan.Token(start_i);
        plan.Token(name_i);
        plan.Build(Tokens::kPattern);
    }

    //   case -1 + 2j:
    //        ^^^^^^^
    //   a pattern: a leaf for each token
    void _Number(CPlan& plan, Index start_i, Index end_i) {
        Index i = start_i;
        const auto take_number = [&] {
            const bool is_number = _fTokens.Type(i) == kTokenId_NUMBER;
            is_number ? plan.Token(i++) : plan.Fail(i);
            return is_number;
        };
        if (_IsSign(i)) plan.Token(i++);
        if (!take_number()) return;
        if (_IsSign(i)) {
            plan.Token(i++);
            if (!take_number()) return;
        }
        if (i != end_i) return plan.Fail(i);
        plan.Build(Tokens::kPattern);
    }

    //   case a.b.c:
    //        ^^^^^
    //   an expression: a leaf for each token
    void _DottedName(CPlan& plan, Index start_i, Index end_i) {
        bool dot_is_due = false;
        for (Index i = start_i; i < end_i; ++i) {
            if (_fTokens.Type(i) != (dot_is_due ? kTokenId_DOT : kTokenId_NAME)) return plan.Fail(i);
            plan.Token(i);
            dot_is_due = !dot_is_due;
        }
        if (!dot_is_due) return plan.Fail(end_i - 1);
        plan.Build(Tokens::kExpression);
    }

    //   case "a" "b":
    //        ^^^^^^^
    //   an atom, as in an expression: a leaf for each string
    void _Strings(CPlan& plan, Index start_i, Index end_i) {
        for (Index i = start_i; i < end_i; ++i) {
            if (_fTokens.Type(i) != kTokenId_STRING) _fTokens.FailAt(i);
            plan.Token(i);
        }
        plan.Build(Tokens::kAtom);
    }

    //   case [a, b]:   case (a, b):
    //        ^^^^^^         ^^^^^^
    //   a sequence pattern: the bracket, the patterns with the commas, the bracket
    void _Sequence(CPlan& plan, Index start_i, Index end_i) {
        if (start_i + 1 >= end_i) _fTokens.FailAt(start_i);
        const Index close_i = end_i - 1;
        const int close_type = _fTokens.Type(start_i) == kTokenId_LSQB ? kTokenId_RSQB : kTokenId_RPAR;
        plan.Token(start_i);
        _Patterns(plan, start_i + 1, close_i);
        if (_fTokens.Type(close_i) != close_type) plan.Fail(close_i);
        plan.Token(close_i);
        plan.Build(Tokens::kSequencePattern);
    }

    //   case {"a": 1, **rest}:
    //        ^^^^^^^^^^^^^^^^
    //   a sequence pattern: `{`, "a", `:`, 1, `**`, rest, `}`; the commas have no node
    void _Mapping(CPlan& plan, Index start_i, Index end_i) {
        if (start_i + 1 >= end_i) _fTokens.FailAt(start_i);
        const Index close_i = end_i - 1;
        plan.Token(start_i);
        Index colon_i = start_i;
        for (Index i = start_i + 1; i < close_i;) {
            const Index comma_i = _FindOrEnd(pattern_mark::kComma, i, close_i);
            // Not stopped by the comma: keys come first.
            if (colon_i != kNone) colon_i = _fTokens.Find(pattern_mark::kColon, i, close_i);
            if (colon_i == kNone && _fTokens.Type(i) != kTokenId_DOUBLESTAR) return plan.Fail(i);
            if (colon_i != kNone) plan.Pattern(i, colon_i);
            const Index mark_i = colon_i == kNone ? i : colon_i;
            plan.Token(mark_i);
            plan.Pattern(mark_i + 1, comma_i);
            i = comma_i + 1;
        }
        if (_fTokens.Type(close_i) != kTokenId_RBRACE) plan.Fail(close_i);
        plan.Token(close_i);
        plan.Build(Tokens::kSequencePattern);
    }

    //   case Point(0, y=0):
    //        ^^^^^^^^^^^^^
    //   a class pattern: the name, `(`, the arguments with the commas; `)` has no node
    void _ClassPattern(CPlan& plan, Index start_i, Index end_i) {
        const Index paren_i = _fTokens.Find(pattern_mark::kOpening, start_i, end_i);
        if (paren_i == kNone) _fTokens.FailAt(start_i);
        plan.Part(EKind::kDottedName, start_i, paren_i);
        plan.Token(paren_i);
        for (Index i = paren_i + 1; i < end_i - 1;) {
            const Index comma_i = _fTokens.Find(pattern_mark::kComma, i, end_i);
            const Index part_end = comma_i == kNone ? end_i - 1 : comma_i;
            plan.Part(EKind::kClassArgument, i, part_end);
            if (comma_i != kNone) plan.Token(comma_i);
            i = part_end + 1;
        }
        if (_fTokens.Type(end_i - 1) != kTokenId_RPAR) plan.Fail(end_i - 1);
        plan.Build(Tokens::kClassPattern);
    }

    //   case Point(0, y=0):
    //                 ^^^    a class argument: the name, `=`, the pattern
    //              ^         a pattern
    void _ClassArgument(CPlan& plan, Index start_i, Index end_i) {
        const Index eq_i = _fTokens.Find(pattern_mark::kEqual, start_i, end_i);
        if (eq_i == kNone) return plan.Pattern(start_i, end_i);
        if (eq_i != start_i + 1) _fTokens.FailAt(eq_i);
        plan.Token(start_i);
        plan.Token(eq_i);
        plan.Pattern(eq_i + 1, end_i);
        plan.Build(Tokens::kClassArgumentPattern);
    }

    Tokens _fTokens;
};

}  // namespace codeloom
