// `match` and `case` as the language has them, where the base parser takes a part of it.
//   case a, b:    case *a, b:    case ():    case "a" "b":
//   in     the same as there
//   out    the same nodes; a sequence without brackets is a CSequencePatternNode of patterns and commas alone
//   keeps  the tokens of the line as they came, while it is parsed
// Whatever isn't a pattern is parsed with the indexes that its tokens have in the line, so that errors name
// their place, those of walkers too.
#pragma once

#include "parse/match_case_parser.h"
#include "parse/parser_driver.h"

namespace codeloom {

class CExtendedMatchCaseParser : public CMatchCaseStatementParser {
  public:
    nb::tuple _RemoveSkipToks(nb::tuple toks, nb::tuple positions) override;
    CNodeRef ParseMatchStmt(nb::tuple toks, nb::tuple positions) override;
    CNodeRef _ParseMatchStmtImpl() override;
    CNodeRef ParseCaseStmt(nb::tuple toks, nb::tuple positions) override;
    CNodeRef _ParseCaseStmtImpl() override;
    CNodeRef _NodeForPattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as = true) override;
    void DoPatternStep(CPatternWork& work, const CPatternStep& step) override;

    template <class Visitor>
    void References(Visitor&& visit) {
        CMatchCaseStatementParser::References(visit);
        visit(_fLineToks);
        visit(_fLinePositions);
    }

  protected:
    Py_ssize_t _FindCaseColon() override;

  private:
    struct CPatternTokens;
    void _RefuseKeyword(Py_ssize_t tok_i);
    Py_ssize_t _IndexInLine(Py_ssize_t tok_i) const;
    CNodeRef _Parse(nb::tuple toks);

    nb::object _fLineToks = nb::none();       // tuple of the line's token texts; none between two parses
    nb::object _fLinePositions = nb::none();  // tuple of their positions; none between two parses
};

void BindExtendedMatchCaseParser(nb::module_& module);

}  // namespace codeloom
