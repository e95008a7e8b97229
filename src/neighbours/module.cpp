// codeloom._neighbours: what stands beside the engine. The importable modules are thin Python files over it.
#include "neighbours/bind.h"

NB_MODULE(_neighbours, module) {
    nanobind::set_leak_warnings(true);
    codeloom::BindTokenTypes(module);
    codeloom::BindLogicals(module);
    codeloom::BindOptpgen(module);
    codeloom::BindStrutils(module);
    codeloom::BindFastAccess(module);
    codeloom::BindSymbolInfo(module);
}
