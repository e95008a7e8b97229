// analysis/: one logical line in, its records and at most one error out.
//   in     a CLogicalLine, whether it lies in an `async def`, whether it is the first line of a def
//   out    records on the line; a SyntaxError object, returned and not raised
//   keeps  the parser driver and the two walkers
//   start  at CPGenAnalyzerImpl::AnalyzeSingleLogical
#pragma once

#include <nanobind/nanobind.h>

#include "hints/type_hint_walker.h"
#include "host/errors.h"
#include "parse/parser_driver.h"
#include "parse/pgen_analyzer.h"
#include "walker/node_walker.h"

namespace codeloom {

// The parts that an analyzer is made of; an extension makes them from its own subclasses.
struct CAnalyzerParts {
    CRef<CPGenParserImpl> parser;
    CRef<CNodeWalker> node_walker;
    CRef<CTypeHintWalker> type_hint_walker;
};

// The parts around two parsers: the walkers of the system.
CAnalyzerParts PartsAround(CRef<CPGenParserImpl> parser, nb::object version_triple,
                           CRef<CPGenParserImpl> hint_parser);

class CPGenAnalyzerImpl : public CPGenAnalyzer {
  public:
    void Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq, bool py3_grammar,
              nb::object hint_grammar_file);
    void InitFromParts(CAnalyzerParts parts);

    nb::object AnalyzeSingleLogical(CLogicalLine& logical, bool in_async_def, bool first_in_def) override;
    OPERATIONS_OF(CPGenAnalyzerImpl, CPGenAnalyzer)
    OPERATION(bool, _InspectSingleLogical,
              (CLogicalLine& logical, bool in_async_def, bool in_embedded_expression, bool first_in_def),
              " Inspect given logical.  Raises SyntaxError or ValueError on\n        unparsable logical ",
              "logical"_a, "in_async_def"_a, "in_embedded_expression"_a = false, "first_in_def"_a = false);
    OPERATION(void, _InspectEmbeddedExpressions,
              (CLogicalLine& logical, CNodeRef node, bool in_async_def, bool first_in_def),
              " Inspect all embedded expressions.  Will raise exceptions on parse errors ", "logical"_a,
              "node"_a.none(), "in_async_def"_a, "first_in_def"_a);
    END_OPERATIONS

    CNodeRef ParseToNode(CLogicalLine& logical, bool in_async_def);
    CNodeRef ParseTokenListToNode(nb::list logical, bool in_async_def);
    nb::list GetTypeParameterNodes(nb::tuple toks);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fLogicalParser);
        visit(__GetTime);
        visit(_fNodeWalker);
        visit(_fTypeHintWalker);
    }

    CRef<CNodeWalker> _fNodeWalker;
    CRef<CTypeHintWalker> _fTypeHintWalker;

  private:
    void _WalkAndInspect(CLogicalLine& logical, const CNodeRef& node, bool in_async_def,
                         bool in_embedded_expression, bool first_in_def);
    void _InspectEmbedded(CLogicalLine& logical, CLogicalLine& exp_logical, bool in_async_def,
                          bool first_in_def);
    nb::object _ErrorToReport(CLogicalLine& logical, const CHostError& error);

    CRef<CPGenParserImpl> _fLogicalParser;
    nb::object __GetTime = nb::none();
};

void BindAnalyzer(nb::module_& module);

}  // namespace codeloom
