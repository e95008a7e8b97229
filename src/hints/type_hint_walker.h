// The walker for type hints. So far it makes its parser and visits every node.
#pragma once

#include <nanobind/nanobind.h>

#include "hints/dispatch_walker.h"
#include "parse/parser_driver.h"
#include "walker/node_walker.h"

namespace codeloom {

class CTypeHintWalker : public CDispatchWalker {
  public:
    // `grammar_file` is the grammar of hints, which may be another than that of the code.
    void Init(nb::object version_triple, nb::object grammar_file, CRef<CNodeWalker> general_node_walker);

    void Walk(CNodeRef node, CLogicalLine& logical, bool first_in_def) override;

    template <class Visitor>
    void References(Visitor&& visit) {
        CDispatchWalker::References(visit);
        visit(_fHintParser);
        visit(_fGeneralNodeWalker);
    }

  private:
    CRef<CPGenParserImpl> _fHintParser;
    CRef<CNodeWalker> _fGeneralNodeWalker;
};

void BindTypeHintWalker(nb::module_& module);

}  // namespace codeloom
