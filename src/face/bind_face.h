#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

// Binds Analysis and what it consists of.
void BindFace(nanobind::module_& module);

}  // namespace codeloom
