// ParseError, the host's exception for a token that the grammar refuses.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

void BindParseError(nb::module_& module);

[[noreturn]] void RaiseParseError(const char* msg, nb::handle type, nb::handle value, nb::handle context);

}  // namespace codeloom
