// Composing records: what the walkers ask for with each name and literal.
//   in     texts, as UTF-8
//   out    records, or pieces of them, as UTF-8
#pragma once

#include <string>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The record of a literal: the prefix, the type, ":", and, where there is a `text`, a blank and the text.
// TypeError when `text` is neither a string nor none.
nb::object BuildLiteralInfo(std::string_view type_name, nb::handle text);

// A scope with an index after every name: "A#1.f" gives "A#1.f#0". Wildcards and the names of def line
// scopes have none, and neither has the module's scope.
std::string EnsureScopeNameIndicies(std::string_view scope);

// The name that stands for an instance of a class: `list` gives "list:". The index of a first definition is
// left out, so that "A#0.B#1" gives "A.B#1:".
std::string GetInstanceNameForClass(std::string_view cls_name);

}  // namespace codeloom
