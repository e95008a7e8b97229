#include "_fastaccess/bind.h"

#include "_fastaccess/bytes.h"
#include "_fastaccess/clock.h"
#include "_fastaccess/non_nested_search.h"
#include "_fastaccess/numbers.h"
#include "strutils/arguments.h"

namespace codeloom {

namespace {

// OverflowError for a negative integer, which the usual conversion takes for a wrong type.
double HostDoubleValueForULongLongBits(nb::handle l) {
    const uint64_t bits = PyLong_AsUnsignedLongLong(l.ptr());
    if (PyErr_Occurred() != nullptr) throw nb::python_error();
    return DoubleValueForULongLongBits(bits);
}

void BindNonNestedStruct(nb::module_& module) {
    module.def(
        "InitNonNestedStruct",
        [](CNonNestedSearch& structure, const nb::object& search_ptr, nb::handle to_find_bytes,
           Py_ssize_t start, Py_ssize_t end) {
            return CheckedResult(structure.InitStruct(search_ptr, to_find_bytes, start, end), -1);
        },
        "structure"_a, "search_ptr"_a.none(), "to_find_bytes"_a.none(), "start"_a, "end"_a,
        nb::sig("def InitNonNestedStruct(structure: CNonNestedSearch, search_ptr: bytes | str | None, "
                "to_find_bytes: bytes, start: int, end: int) -> int"),
        "Search the UTF-8 bytes start..end of a byte or text string for `to_find_bytes`; None is for no\n"
        "text at all. Returns 0. TypeError for anything else, AssertionError when `start` or `end` lies\n"
        "outside the text.");
    module.def(
        "FindNextNonNestedStruct",
        [](CNonNestedSearch& structure) {
            return CheckedResult(structure.FindNextInStruct(), Py_ssize_t{-2});
        },
        "structure"_a, nb::sig("def FindNextNonNestedStruct(structure: CNonNestedSearch) -> int"),
        "The byte offset of the next hit outside brackets and strings; -1 when there is none.");
}

}  // namespace

void BindFastAccessPrimitives(nb::module_& module) {
    BindNonNestedStruct(module);
    module.def(
        "StrInStr",
        [](nb::handle sub, nb::handle whole) { return CheckedResult(StrInStr(sub, whole), -1) != 0; },
        "sub"_a.none(), "whole"_a.none(), nb::sig("def StrInStr(sub: bytes, whole: bytes) -> bool"),
        "True when `sub` occurs in `whole`, where a zero byte ends either of them. TypeError unless both\n"
        "are byte strings.");
    module.def(
        "IsAlnum", [](CByteArgument c) { return IsAlnum(c.byte); }, "c"_a,
        "True for the byte of an ASCII letter or digit.");
    module.def(
        "IsDigit", [](CByteArgument c) { return IsDigit(c.byte); }, "c"_a,
        "True for the byte of an ASCII digit.");
    module.def("ULongLongValueForDoubleBits", &ULongLongValueForDoubleBits, "f"_a,
               "The unsigned integer with the 64 bits of a float.");
    module.def(
        "DoubleValueForULongLongBits", &HostDoubleValueForULongLongBits, "l"_a.none(),
        nb::sig("def DoubleValueForULongLongBits(l: int) -> float"),
        "The float with the bits of an unsigned integer. OverflowError when that is negative or has more\n"
        "than 64 bits.");
    module.def(
        "DoubleValueForPyIntBits",
        [](nb::handle l) { return CheckedResult(DoubleValueForPyIntBits(l), -1.0); }, "l"_a.none(),
        nb::sig("def DoubleValueForPyIntBits(l: int) -> float"),
        "The float with the low 64 bits of an integer of any sign.");
    module.def(
        "GetNowTime", [] { return CheckedResult(GetNowTime(), -1.0); },
        "The time of day in seconds, as time.time() gives it.");
    module.def(
        "OutOfTime", [](double end_time) { return CheckedResult(OutOfTime(end_time), -1) != 0; },
        "end_time"_a, "True from the moment `end_time`, in seconds, on.");
    module.def(
        "LocationsEqual", [](nb::handle loc1, nb::handle loc2) { return LocationsEqual(loc1, loc2); },
        "loc1"_a.none(), "loc2"_a.none(), nb::sig("def LocationsEqual(loc1: object, loc2: object) -> bool"),
        "True when both are the same object: locations are shared.");
}

}  // namespace codeloom
