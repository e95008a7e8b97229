// The records that the walk for names makes of a text, shown to those who work on it.
#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

void BindNames(nanobind::module_& module);

}  // namespace codeloom
