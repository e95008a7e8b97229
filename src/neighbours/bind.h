// Binding of the neighbour modules, all in one extension.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

void BindTokenTypes(nb::module_& module);
void BindLogicals(nb::module_& module);
void BindOptpgen(nb::module_& module);
void BindStrutils(nb::module_& module);
void BindFastAccess(nb::module_& module);
void BindSymbolInfo(nb::module_& module);

}  // namespace codeloom
