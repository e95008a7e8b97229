// The kinds of what the face shows, as enums of the host.
#pragma once

#include <nanobind/nanobind.h>

#include "file/file_analysis.h"
#include "scopes/queries.h"

namespace nb = nanobind;

namespace codeloom {

// Makes the enums in the module, from the tables of the pipeline.
void BindKinds(nb::module_& module);

// Members of these enums.
nb::object RecordKindOf(char kind);
nb::object LineKindOf(ELogicalType type);
nb::object LimitKindOf(ELimit limit);
nb::object RoleOf(ERole role);
nb::object ScopeKindOf(EScopeKind kind);
nb::object ParameterKindOf(EParameterKind kind);
nb::object HintKindOf(EHintKind kind);
nb::object ResolutionOf(EResolution resolution);

// The word for a role and for a kind of scope.
std::string_view WordOfRole(ERole role);
std::string_view WordOfScopeKind(EScopeKind kind);

// The form of a kind's payload, and the word for the kind.
std::string_view PayloadFormOf(char kind);
std::string_view WordOfRecordKind(char kind);

}  // namespace codeloom
