// The one table that ties grammar states and token types to node classes.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The states and tokens that are named directly: state or token name to class.
nb::dict DirectClsForState();

// The class for each node type of `grammar`, by number; the entry of the highest state stays none. Classes
// are those in the home module's namespace; `cls_for_state` gets the names of the rules that they support.
nb::list BuildClsForStateList(nb::handle grammar, nb::dict cls_for_state);

// The same list without what a host has changed since the classes were bound.
nb::list OriginalClsForStateList(nb::handle grammar);

// Takes the classes and states as they are now for the original ones.
void RememberClsForState();

}  // namespace codeloom
