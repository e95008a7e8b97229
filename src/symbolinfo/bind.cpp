#include "symbolinfo/bind.h"

#include "strutils/arguments.h"
#include "symbolinfo/predicates.h"
#include "symbolinfo/scoped_text.h"

namespace codeloom {

namespace {

Py_ssize_t HostNextNonNested(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    if (!utf8_ptr.HasByteAt(pos, end_pos)) return -1;
    return NextNonNestedUtf8PtrIndex(utf8_ptr.Pointer(), pos, end_pos);
}

unsigned char HostGetInfoBytesKind(const CUtf8Argument& ibytes_ptr) {
    return static_cast<unsigned char>(GetInfoBytesKind(ibytes_ptr.Pointer()));
}

}  // namespace

void BindSymbolPrimitives(nb::module_& module) {
    module.def(
        "IsDefKind", [](CByteArgument kind) { return IsDefKind(kind.byte); }, "kind"_a,
        "True for the kinds of what a `def` makes: functions, methods and unbound methods.");
    module.def(
        "GetInfoBytesKind", &HostGetInfoBytesKind, "ibytes_ptr"_a,
        "The kind of a record, as an integer: its second byte when its first is \":\", and kPlainEquivKind\n"
        "otherwise.");
    module.def(
        "IsTopLevelModuleScope",
        [](nb::handle scope) { return CheckedResult(IsTopLevelModuleScope(scope), -1) != 0; },
        "scope"_a.none(), nb::sig("def IsTopLevelModuleScope(scope: collections.abc.Sized) -> bool"),
        "True for the module's own scope, which is empty. TypeError for what has no length.");
    module.def(
        "IsDefLineScope", [](nb::handle scope) { return CheckedResult(IsDefLineScope(scope), -1) != 0; },
        "scope"_a.none(), nb::sig("def IsDefLineScope(scope: str) -> bool"),
        "True for the scope of a def line itself. TypeError unless `scope` is a text string.");
    module.def(
        "IsParentOfDefLineScope",
        [](nb::handle maybe_parent, nb::handle def_line_scope) {
            return CheckedResult(IsParentOfDefLineScope(maybe_parent, def_line_scope), -1) != 0;
        },
        "maybe_parent"_a.none(), "def_line_scope"_a.none(),
        nb::sig("def IsParentOfDefLineScope(maybe_parent: str, def_line_scope: str) -> bool"),
        "True when `maybe_parent`, a scope known to be related, is the one around a def line's scope: the\n"
        "lengths alone are compared. TypeError unless both are text strings.");
    module.def(
        "NextNonNestedUtf8PtrIndex", &HostNextNonNested, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        "The byte index after `pos` that isn't nested: after the bracket or string that begins at `pos`,\n"
        "otherwise the next one. -1 when `pos` isn't in the buffer, ValueError when `end_pos` lies outside\n"
        "it. A prefix of a string is walked byte by byte.");
}

}  // namespace codeloom
