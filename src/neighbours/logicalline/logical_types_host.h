// The logical types as the host's text constants.
#pragma once

#include <nanobind/nanobind.h>

#include "tokenizer/logical_types.h"

namespace nb = nanobind;

namespace codeloom {

// The constant of a logical type, one object for each.
nb::object HostText(ELogicalType type);

// Puts all constants into `module` under their names.
void BindLogicalTypes(nb::module_& module);

}  // namespace codeloom
