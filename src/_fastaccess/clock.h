// The clock for time limits: the time of day in seconds, as the host callable `_fastaccess.__TimeFunc` gives
// it.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// Seconds. On failure -1.0, with what the callable raised.
inline double GetNowTime() {
    try {
        const nb::object now = nb::module_::import_("codeloom._fastaccess").attr("__TimeFunc")();
        return PyFloat_AsDouble(now.ptr());
    } catch (nb::python_error& error) {
        error.restore();
        return -1.0;
    }
}

// True from the moment `end_time` on. On failure -1.
inline int OutOfTime(double end_time) {
    const double now = GetNowTime();
    if (now == -1.0 && PyErr_Occurred() != nullptr) return -1;
    return now >= end_time;
}

}  // namespace codeloom
