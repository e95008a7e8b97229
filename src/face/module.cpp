// The entry of codeloom._analysis, which the package's face is made of.
#include <nanobind/nanobind.h>

#include "face/bind_document.h"
#include "face/bind_face.h"
#include "face/file_reader.h"
#include "face/names.h"
#include "face/trees.h"
#include "host/module_entry.h"

CODELOOM_MODULE(_analysis, module) {
    nanobind::set_leak_warnings(false);
    codeloom::BindFace(module);
    codeloom::BindDocument(module);
    codeloom::BindFileReader(module);
    codeloom::BindNames(module);
    codeloom::BindTrees(module);
}
