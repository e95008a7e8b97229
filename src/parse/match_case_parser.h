// `match` and `case` statements, which the grammar files don't know (PEP 634).
//   in     the tokens and positions of a logical line whose first token is `match` or `case`
//   out    a CMatchStmt or a CCaseStmt; none where the word is a plain name; ParseError at the exact token of
//          a bad pattern
//   keeps  the tokens of the line while it is parsed, nothing afterwards
//   start  at ParseMatchStmt and ParseCaseStmt here; patterns are in case_patterns.cpp
#pragma once

#include <functional>
#include <vector>

#include <nanobind/nanobind.h>

#include "parse/pattern_work.h"
#include "parse/token_search.h"
#include "tree/node_factory.h"

namespace codeloom {

class CPGenParserImpl;

// Subject, guard and body go to the grammar, patterns are parsed here by descent. It isn't a full
// checker of patterns: it decides by the first token and by separators outside brackets.
//
// Comments and continuation backslashes are taken out first, so that the tokens have other indexes here than
// in the logical line. Hence the leaves made here and the ParseErrors raised here have the token's position,
// a (row, column) tuple, where others have its index.
class CMatchCaseStatementParser : public CHosted {
  public:
    ~CMatchCaseStatementParser() override;

    // `pgen_parser` parses what isn't a pattern, and its factory makes the leaves.
    void Init(CRef<CPGenParserImpl> pgen_parser);

    OPERATIONS_OF(CMatchCaseStatementParser, CNoOperations)
    OPERATION(Py_ssize_t, _NonNestedFindTokenIndex, (nb::str tok, Py_ssize_t start, Py_ssize_t end),
              "The index in [start, end) of the token text `tok` outside brackets; -1 when there is none.",
              "tok"_a, "start"_a, "end"_a);
    OPERATION(nb::tuple, _RemoveSkipToks, (nb::tuple toks, nb::tuple positions),
              "The tokens without comments and line continuations, and their positions: a pair of tuples.",
              "toks"_a, "positions"_a);
    OPERATION(CNodeRef, ParseMatchStmt, (nb::tuple toks, nb::tuple positions),
              "The CMatchStmt of a logical line, given as tuples of token texts and (row, column) positions; "
              "None when it is no `match` statement (PEP 634). ParseError on a bad subject.",
              "toks"_a, "positions"_a);
    OPERATION(CNodeRef, _ParseMatchStmtImpl, (), "ParseMatchStmt for the tokens of the line under way.");
    OPERATION(CNodeRef, ParseCaseStmt, (nb::tuple toks, nb::tuple positions),
              "The CCaseStmt of a logical line, given as tuples of token texts and (row, column) positions; "
              "None when it is no `case` statement (PEP 634). ParseError on a bad pattern, guard or body.",
              "toks"_a, "positions"_a);
    OPERATION(CNodeRef, _ParseCaseStmtImpl, (), "ParseCaseStmt for the tokens of the line under way.");
    OPERATION(CNodeRef, _NodeForPattern, (Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as = true),
              "The node of the pattern in [start_i, end_i). `allow_as`: the range may end in `as name`.",
              "start_i"_a, "end_i"_a, "allow_as"_a = true);
    OPERATION(CNodeRef, _NodeForClassPattern, (Py_ssize_t start_i, Py_ssize_t end_i),
              "The CClassPatternNode of `Name(pattern, name=pattern)`.", "start_i"_a, "end_i"_a);
    OPERATION(CNodeRef, _NodeForDottedNameValue, (Py_ssize_t start_i, Py_ssize_t end_i),
              "The CExpression of `name.name`; its text and context are None.", "start_i"_a, "end_i"_a);
    OPERATION(CNodeRef, _NodeForNumberPattern, (Py_ssize_t start_i, Py_ssize_t end_i),
              "The CPatternNode of a number with a sign or an imaginary part.", "start_i"_a, "end_i"_a);
    OPERATION(CNodeRef, _TokNode, (Py_ssize_t tok_i),
              "A leaf for the token at `tok_i`, with the token's position as context.", "tok_i"_a);
    OPERATION(CNodeRef, _NodeForSequencePattern, (Py_ssize_t start_i, Py_ssize_t end_i),
              "The CSequencePatternNode of a sequence in brackets or parentheses.", "start_i"_a, "end_i"_a);
    OPERATION(CNodeRef, _NodeForMappingPattern, (Py_ssize_t start_i, Py_ssize_t end_i),
              "The CSequencePatternNode of a mapping in braces.", "start_i"_a, "end_i"_a);
    OPERATION(nb::object, _ParseExceptionAt, (Py_ssize_t error_i),
              "A ParseError at the token `error_i`, with the token's position as context; not raised here.",
              "error_i"_a);

    template <class Below>
    class TOfHost : public Below {
      public:
        void DoPatternStep(CPatternWork& work, const CPatternStep& step) override {
            using EKind = CPatternStep::EKind;
            switch (step.kind) {
                case EKind::kPattern:
                    return work.AddNode(this->_NodeForPattern(step.start_i, step.end_i, step.allow_as));
                case EKind::kClassPattern:
                    return work.AddNode(this->_NodeForClassPattern(step.start_i, step.end_i));
                case EKind::kDottedName:
                    return work.AddNode(this->_NodeForDottedNameValue(step.start_i, step.end_i));
                case EKind::kNumber:
                    return work.AddNode(this->_NodeForNumberPattern(step.start_i, step.end_i));
                case EKind::kSequence:
                    return work.AddNode(this->_NodeForSequencePattern(step.start_i, step.end_i));
                case EKind::kMapping:
                    return work.AddNode(this->_NodeForMappingPattern(step.start_i, step.end_i));
                default:
                    return Below::DoPatternStep(work, step);
            }
        }
    };
    FOR_HOST_SUBCLASSES(TOfHost)
    END_OPERATIONS

    // Does one step of a pattern: plans the parts of a node, or makes it. A parser of a host subclass makes
    // it by its operations.
    virtual void DoPatternStep(CPatternWork& work, const CPatternStep& step);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fPGenParser);
        visit(_fNodeFactory);
        visit(_fToks);
        visit(_fPositions);
    }

  protected:
    // The two statements; what isn't a pattern is parsed as the caller says.
    CNodeRef _MatchStmt(const std::function<CNodeRef()>& parse_subject);
    CNodeRef _CaseStmt(const std::function<CNodeRef(Py_ssize_t start_i, Py_ssize_t end_i)>& parse_range);

    using CPlan = CPatternWork::CPlan;

    struct CPatternTokens;  // see pattern_tokens.h

    // Where the header of a `case` ends; -1 when it doesn't.
    virtual Py_ssize_t _FindCaseColon();
    // The node that the steps which are left lead to.
    CNodeRef _Finish(CPatternWork& work);

    // Tokens of the line; IndexError outside it, TypeError while there is none.
    Py_ssize_t _TokCount() const;
    nb::object _Tok(Py_ssize_t tok_i) const;
    nb::object _Position(Py_ssize_t tok_i) const;
    int _TokType(Py_ssize_t tok_i) const;
    bool _IsTok(Py_ssize_t tok_i, std::string_view text) const;

    // -1 where `tok` isn't found.
    Py_ssize_t _Find(const char* tok, Py_ssize_t start_i, Py_ssize_t end_i);

    [[noreturn]] void _FailAt(Py_ssize_t error_i);

    CRef<CPGenParserImpl> _fPGenParser;
    CRef<CNodeFactory> _fNodeFactory;

  private:
    void _SetLine(const nb::tuple& toks_and_positions);
    void _ForgetLine();
    bool _IsStatementOfType(nb::handle logical_type) const;
    CNodeRef _ParseRange(Py_ssize_t start_i, Py_ssize_t end_i);

    // The node of one pattern, see case_patterns.cpp.
    CNodeRef _NodeFor(const CPatternStep& first);

    nb::object _fToks = nb::none();       // tuple of the line's token texts; none between two parses
    nb::object _fPositions = nb::none();  // tuple of their positions; none between two parses
    CBracketSteps _fBracketSteps;         // those of _fToks
};

void BindMatchCaseParser(nb::module_& module);

}  // namespace codeloom
