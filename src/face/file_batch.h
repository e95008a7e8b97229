// Many files at a time: read and analysed without the interpreter, whose lock is given up once for all of
// them.
#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

void BindFileBatch(nanobind::module_& module);

}  // namespace codeloom
