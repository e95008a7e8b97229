// codeloom._neighbours: what is beside the engine. The importable modules are thin Python files over it.
#include "host/module_entry.h"
#include "neighbours/bind.h"

CODELOOM_MODULE(_neighbours, module) {
    // An analyzer that a host still holds at the interpreter's end isn't a leak; `make leaks` looks for
    // those.
    nanobind::set_leak_warnings(false);
    codeloom::BindTokenTypes(module);
    codeloom::BindLogicals(module);
    codeloom::BindOptpgen(module);
    codeloom::BindStrutils(module);
    codeloom::BindFastAccess(module);
    codeloom::BindSymbolInfo(module);
}
