// The abstract base that the analyzer and the parser driver share.
#pragma once

#include <nanobind/nanobind.h>

#include "neighbours/logicalline/logical_line.h"
#include "neighbours/optpgen/node_converter.h"

namespace codeloom {

class CPGenAnalyzer : public NodeConverter {
  public:
    void Init() {}

    OPERATIONS_OF(CPGenAnalyzer, NodeConverter)
    OPERATION(nb::object, AnalyzeSingleLogical, (CLogicalLine& logical, bool in_async_def, bool first_in_def),
              " Analyze a single logical and return any exception (typically\n"
              "        SyntaxError, but can be other errors). Note that exception is only\n"
              "        returned if logical has not previously been parsed. ",
              "logical"_a, "in_async_def"_a, "first_in_def"_a = false);
    END_OPERATIONS
};

void BindPGenAnalyzer(nb::module_& module);

}  // namespace codeloom
