#include "neighbours/imported_names.h"

#include "host/neighbour_call.h"
#include "neighbours/logical_types.h"

namespace codeloom {

CLogicalTypes gLogicalTypes;

namespace {

nb::object NameOf(nb::handle neighbour, const char* module_name, const char* name) {
    if (nb::hasattr(neighbour, name)) return neighbour.attr(name);
    PyErr_Format(PyExc_ImportError, "cannot import name '%s' from '%s'", name, module_name);
    throw nb::python_error();
}

void ImportFrom(nb::module_& module, const char* module_name, std::initializer_list<const char*> names) {
    const nb::module_ neighbour = nb::module_::import_(module_name);
    for (const char* name : names) module.attr(name) = NameOf(neighbour, module_name, name);
}

nb::handle Kept(nb::handle module, const char* name) {
    return nb::object(module.attr(name)).release();
}

}  // namespace

nb::object ParseErrorClass() {
    static constexpr CNeighbourFunction kParseError("optpgen", "ParseError");
    return kParseError.Find();
}

void ImportNames(nb::module_& module) {
    ImportFrom(module, "codeloom.optpgen", {"Parser"});
    ImportFrom(module, "bytebuffer", {"CWritableByteBuffer", "CEncodedByteBufferReader"});
    ImportFrom(module, "codeloom.logicalline", {"CLogicalLine"});
    ImportFrom(module, "tarnbase.destroyable", {"_CHandlerRecord", "_CEmissionStackItem", "CDestroyable"});
#define CODELOOM_LOGICAL_TYPE_NAME(name, text) #name,
    ImportFrom(module, "codeloom.logicalline", {CODELOOM_LOGICAL_TYPES(CODELOOM_LOGICAL_TYPE_NAME)});
#undef CODELOOM_LOGICAL_TYPE_NAME
    gLogicalTypes = {Kept(module, "kComment"), Kept(module, "kCommentedTypeHint"),
                     Kept(module, "kStringifiedTypeHint"), Kept(module, "kMatch"), Kept(module, "kCase")};
}

}  // namespace codeloom
