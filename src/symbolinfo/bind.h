// The questions about kinds, records and scopes as the host calls them.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

void BindSymbolPrimitives(nb::module_& module);

}  // namespace codeloom
