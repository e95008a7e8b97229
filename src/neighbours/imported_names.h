// Constants and classes of the neighbours that the engine imports by name while it loads.
#pragma once

#include <nanobind/nanobind.h>

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

// `optpgen.ParseError`, looked up on the module at the call.
nb::object ParseErrorClass();

// Binds every name into `module`; a neighbour that lacks one is an ImportError which names it.
void ImportNames(nb::module_& module);

}  // namespace codeloom
