// The text primitives as the host calls them.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

void BindTextPrimitives(nb::module_& module);

}  // namespace codeloom
