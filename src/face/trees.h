// The plain trees of a text, shown to those who work on the parser.
#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

void BindTrees(nanobind::module_& module);

}  // namespace codeloom
