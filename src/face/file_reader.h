// Many files: read and analysed by threads that need no interpreter, some at a time.
#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

void BindFileReader(nanobind::module_& module);

}  // namespace codeloom
