#include "_fastaccess/bind.h"

#include "_fastaccess/bytes.h"
#include "_fastaccess/clock.h"
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

}  // namespace

void BindFastAccessPrimitives(nb::module_& module) {
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
