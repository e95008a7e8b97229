// Constants and classes of the neighbours that the engine imports by name while it loads.
#pragma once

#include <nanobind/nanobind.h>

#include "names/record_kinds.h"
#include "neighbours/logicalline/logical_line.h"

namespace codeloom {

// The logical types that the engine acts on, as the neighbour's text constants. They live as long as the
// process.
struct CLogicalTypes {
    nb::handle kComment;
    nb::handle kCommentedTypeHint;
    nb::handle kStringifiedTypeHint;
    nb::handle kMatch;
    nb::handle kCase;
};
extern CLogicalTypes gLogicalTypes;

inline bool IsOfType(const CLogicalLine& logical, nb::handle type) {
    return logical.fType.equal(type);
}

// The prefixes as the neighbour's byte strings, for records that are a prefix and no more. They live as long
// as the process.
struct CPrefixes {
#define CODELOOM_PREFIX_FIELD(name, ...) nb::handle k##name##Prefix;
    CODELOOM_RECORD_KINDS(CODELOOM_PREFIX_FIELD)
#undef CODELOOM_PREFIX_FIELD
};
extern CPrefixes gPrefixes;

// `optpgen.ParseError`, looked up on the module at the call.
nb::object ParseErrorClass();

bool IsParseError(const nb::python_error& error);

// An ImportError which names the neighbour and the name unless the neighbour has all of them.
void RequireNames(const char* module_name, std::initializer_list<const char*> names);

// Binds every name into `module`, under the same condition.
void ImportNames(nb::module_& module);

}  // namespace codeloom
