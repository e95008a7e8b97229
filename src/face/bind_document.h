#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

void BindDocument(nanobind::module_& module);

}  // namespace codeloom
