// The kinds of what the face shows, as enums of the host.
#pragma once

#include <nanobind/nanobind.h>

#include "file/kind_words.h"

namespace nb = nanobind;

namespace codeloom {

// Makes the enums in the module, from the tables of the pipeline.
void BindKinds(nb::module_& module);

// Members of these enums.
nb::object MemberOf(ERecordKind kind);
nb::object MemberOf(ELogicalType type);
nb::object MemberOf(ELimit limit);
nb::object MemberOf(ERole role);
nb::object MemberOf(EScopeKind kind);
nb::object MemberOf(EParameterKind kind);
nb::object MemberOf(EHintKind kind);
nb::object MemberOf(EResolution resolution);  // None for none

}  // namespace codeloom
