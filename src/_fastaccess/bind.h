// The fast-access primitives as the host calls them.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

void BindFastAccessPrimitives(nb::module_& module);

}  // namespace codeloom
