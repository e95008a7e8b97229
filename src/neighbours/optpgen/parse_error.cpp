#include "neighbours/optpgen/parse_error.h"

#include <nanobind/eval.h>

#include "host/errors.h"

namespace codeloom {

namespace {

constexpr const char* kSource = R"(
class ParseError(Exception):
    """A text isn't what the grammar allows.

    ParseError(msg, type, value, context): what is wrong (str), and the type (int), the text (str) and the
    context of the token that was refused, as they were fed; all four are attributes. Type and value are None
    where it wasn't a token that was refused.
    """

    def __init__(self, msg, type, value, context):
        super().__init__(msg, type, value, context)
        self.msg = msg
        self.type = type
        self.value = value
        self.context = context

    def __str__(self):
        return f"{self.msg}: {self.value!r} (token type {self.type}), context {self.context!r}"
)";

PyObject* gParseError = nullptr;  // never unloaded

}  // namespace

void BindParseError(nb::module_& module) {
    nb::dict scope;
    scope["__name__"] = module.attr("__name__");
    scope["__builtins__"] = nb::module_::import_("builtins");
    nb::exec(nb::str(kSource), scope);
    nb::object parse_error = scope["ParseError"];
    module.attr("ParseError") = parse_error;
    gParseError = parse_error.release().ptr();
}

void RaiseParseError(const char* msg, nb::handle type, nb::handle value, nb::handle context) {
    RaiseHostError(nb::handle(gParseError)(msg, type, value, context));
}

}  // namespace codeloom
