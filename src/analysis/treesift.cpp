// The module's entry: codeloom.treesift, loaded by the host.
#include <string>

#include <nanobind/nanobind.h>

#include "analysis/analyzer.h"
#include "analysis/syntax_error.h"
#include "hints/dispatch_walker.h"
#include "host/neighbour_call.h"
#include "host/restore.h"
#include "neighbours/imported_names.h"
#include "parse/parser_driver.h"
#include "tree/node_classes.h"
#include "walker/node_walker.h"

namespace nb = nanobind;

namespace codeloom {

namespace {

nb::module_ ImportNeighbour(const char* name) {
    return nb::module_::import_((std::string("codeloom.") + name).c_str());
}

// Modules whose functions are looked up at the call, as globals that a host or a test can replace.
void ImportModules(nb::module_& module, nb::handle loading) {
    for (const char* name : {"keyword", "re", "sys", "token", "os", "time"})
        module.attr(name) = nb::module_::import_(name);
    module.attr("pgen") = loading.attr("ImportPgen")();
    for (const char* name : {"_fastaccess", "strutils"}) module.attr(name) = ImportNeighbour(name);
    module.attr("config") = nb::module_::import_("config");
    for (const char* name : {"logicalline", "symbolinfo", "logicalinspect"})
        module.attr(name) = ImportNeighbour(name);
    module.attr("reflect") = nb::module_::import_("tarnutils.reflect");
    for (const char* name : {"optpgen", "utils"}) module.attr(name) = ImportNeighbour(name);
}

void SetConstants(nb::module_& module) {
    module.attr("kPy2DefaultGrammar") = "Python-Grammar-2.7";
    module.attr("kPy3DefaultGrammar") = "Python-Grammar-3.8";
}

void BindClasses(nb::module_& module) {
    BindPGenAnalyzer(module);
    BindNodeClasses(module);
    BindSyntaxError(module);
    BindParserDriver(module);
    BindNodeWalker(module);
    BindDispatchWalker(module);
    BindTypeHintWalker(module);
    BindAnalyzer(module);
}

}  // namespace

void Load(nb::module_& module) {
    SetHomeModule(module);
    const nb::module_ loading = nb::module_::import_("codeloom._loading");
    const nb::object standins = loading.attr("StandinsOffered")();
    standins.attr("__enter__")();
    const CCallOnExit withdrawn([&] { standins.attr("__exit__")(nb::none(), nb::none(), nb::none()); });
    ImportNames(module);
    ImportModules(module, loading);
    SetConstants(module);
    BindClasses(module);
}

}  // namespace codeloom

NB_MODULE(treesift, module) {
    codeloom::Load(module);
}
