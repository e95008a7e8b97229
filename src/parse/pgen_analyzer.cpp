#include "parse/pgen_analyzer.h"

namespace codeloom {

nb::object CPGenAnalyzer::AnalyzeSingleLogical(CLogicalLine&, bool, bool) {
    PyErr_SetNone(PyExc_NotImplementedError);
    throw nb::python_error();
}

void BindPGenAnalyzer(nb::module_& module) {
    nb::class_<CPGenAnalyzer, NodeConverter, THostSubclass<CPGenAnalyzer>> binding(
        module, "CPGenAnalyzer", "What analyzes one logical line at a time; a host may derive its own.");
    binding.def(TInit<>());
    BindOperations(binding);
}

}  // namespace codeloom
