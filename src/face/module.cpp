// The entry of codeloom._analysis, on which the package's face stands.
#include <nanobind/nanobind.h>

#include "face/bind_face.h"
#include "face/file_batch.h"
#include "face/names.h"
#include "face/trees.h"
#include "host/module_entry.h"

CODELOOM_MODULE(_analysis, module) {
    nanobind::set_leak_warnings(false);
    codeloom::BindFace(module);
    codeloom::BindFileBatch(module);
    codeloom::BindNames(module);
    codeloom::BindTrees(module);
}
