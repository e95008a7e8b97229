// The constants of the vocabulary as the host sees them.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// A new dictionary: the prefixes and kinds, then all others.
nb::dict ConstantsByName();

}  // namespace codeloom
