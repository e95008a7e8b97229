// The kinds of what the face shows, as enums of the host.
#pragma once

#include <nanobind/nanobind.h>

#include "file/kind_words.h"

namespace nb = nanobind;

namespace codeloom {

// Makes the enums in the module, from the tables of the pipeline.
void BindKinds(nb::module_& module);

// The member of its enum.
template <class Kind>
nb::object MemberOf(Kind kind);
nb::object MemberOf(EResolution resolution);  // None for none

}  // namespace codeloom
