// The module's entry: codeloom.treesift, loaded by the host.
#include <string>

#include <nanobind/nanobind.h>

#include "_fastaccess/bind.h"
#include "analysis/analyzer.h"
#include "extended/extended_analyzer.h"
#include "hints/dispatch_walker.h"
#include "host/module_entry.h"
#include "host/neighbour_call.h"
#include "host/restore.h"
#include "neighbours/imported_names.h"
#include "parse/parser_driver.h"
#include "parse/syntax_error.h"
#include "strutils/bind.h"
#include "strutils/text.h"
#include "symbolinfo/bind.h"
#include "symbolinfo/module_constants.h"
#include "tree/node_classes.h"
#include "walker/node_walker.h"

namespace nb = nanobind;

namespace codeloom {

namespace {

constexpr CNeighbourFunction kEnsureScopeNameIndicies("symbolinfo", "EnsureScopeNameIndicies");
constexpr CNeighbourFunction kGetInstanceNameForClass("symbolinfo", "GetInstanceNameForClass");

void DefinePrimitives(nb::module_& module) {
    BindTextPrimitives(module);
    BindFastAccessPrimitives(module);
    BindSymbolPrimitives(module);
}

// A module of the package under its own name, with the functions that are called through it.
void ImportNeighbour(nb::module_& module, const char* name,
                     std::initializer_list<const char*> functions = {}) {
    const std::string full_name = std::string("codeloom.") + name;
    RequireNames(full_name.c_str(), functions);
    module.attr(name) = nb::module_::import_(full_name.c_str());
}

// The interpreter's pgen module is imported when somebody first looks at it: that takes as long as all the
// rest.
nb::object TakePgen(const nb::str& name) {
    if (!nb::str("pgen").equal(name))
        throw nb::attribute_error(
            nb::str("module 'codeloom.treesift' has no attribute '{}'").format(name).c_str());
    nb::object pgen = nb::module_::import_("codeloom._loading").attr("ImportPgen")();
    HomeModule().attr("pgen") = pgen;
    return pgen;
}

void OfferPgen(nb::module_& module) {
    module.def(
        "__getattr__", &TakePgen, "name"_a, nb::sig("def __getattr__(name: str) -> ModuleType"),
        "The module `pgen`, which is imported when it is first asked for. Raises AttributeError for any "
        "other name.");
    module.def(
        "__dir__",
        [] {
            const nb::dict globals = nb::borrow<nb::dict>(HomeModule().attr("__dict__"));
            nb::list names(globals);
            if (!globals.contains("pgen")) names.append("pgen");
            return names;
        },
        nb::sig("def __dir__() -> list[str]"), "The names in the module, `pgen` among them.");
}

// Modules whose functions are looked up at the call, as globals that a host or a test can replace.
void ImportModules(nb::module_& module) {
    for (const char* name : {"keyword", "re", "sys", "token", "os", "time"})
        module.attr(name) = nb::module_::import_(name);
    OfferPgen(module);
    ImportNeighbour(module, "_fastaccess", {"__TimeFunc"});
    ImportNeighbour(module, "strutils");
    RequireNames("config", {"GetTarnFilename"});
    module.attr("config") = nb::module_::import_("config");
    ImportNeighbour(module, "logicalline", {"FindMatchOrCaseType", "IsScopeStartLogical"});
    ImportNeighbour(module, "symbolinfo");
    ImportNeighbour(module, "logicalinspect", {"TextFromTokens"});
    RequireNames("tarnutils.reflect", {"ReportCurrentException", "RaiseWithTraceback"});
    module.attr("reflect") = nb::module_::import_("tarnutils.reflect");
    ImportNeighbour(module, "optpgen", {"ParserGenerator", "CreateParser", "ParseError"});
    ImportNeighbour(module, "utils", {"GetLogicalsFromText"});
}

nb::object _GetBuiltinInstanceName(nb::handle cls_name) {
    const nb::object name = AsUtf8(kGetInstanceNameForClass(kEnsureScopeNameIndicies(cls_name)));
    return Utf8Concat2(gPrefixes.kTypedLiteralPrefix, name);
}

nb::handle DefineInstanceName(nb::module_& module, const char* constant, const char* cls_name) {
    nb::object name = _GetBuiltinInstanceName(nb::str(cls_name));
    module.attr(constant) = name;
    return name.release();
}

void SetConstants(nb::module_& module) {
    module.attr("kPy2DefaultGrammar") = kPy2DefaultGrammar;
    module.attr("kPy3DefaultGrammar") = kPy3DefaultGrammar;
    module.attr("kLiteralPrefix") = gPrefixes.kTypedLiteralPrefix;
#define CODELOOM_DEFINE_INSTANCE_NAME(name, cls_name) DefineInstanceName(module, #name, cls_name),
    gInstanceNames = {CODELOOM_INSTANCE_NAMES(CODELOOM_DEFINE_INSTANCE_NAME)};
#undef CODELOOM_DEFINE_INSTANCE_NAME
    module.def("_GetBuiltinInstanceName", &_GetBuiltinInstanceName, "cls_name"_a,
               nb::sig("def _GetBuiltinInstanceName(cls_name: str) -> bytes"),
               "The equiv of an instance of a builtin class, by the name of the class.");
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
    BindExtendedAnalyzer(module);
}

}  // namespace

void Load(nb::module_& module) {
    SetHomeModule(module);
    const nb::module_ loading = nb::module_::import_("codeloom._loading");
    const nb::object standins = loading.attr("StandinsOffered")();
    standins.attr("__enter__")();
    const CCallOnExit withdrawn([&] { standins.attr("__exit__")(nb::none(), nb::none(), nb::none()); });
    RequireNames("codeloom.optpgen", {"NodeConverter"});
    ImportNames(module);
    DefinePrimitives(module);
    ImportModules(module);
    SetConstants(module);
    BindClasses(module);
}

}  // namespace codeloom

CODELOOM_MODULE(treesift, module) {
    codeloom::Load(module);
}
