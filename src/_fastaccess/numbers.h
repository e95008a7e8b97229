// Floating values as the integers of the same bits, to be stored and compared as such.
#pragma once

#include <bit>
#include <cstdint>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

inline uint64_t ULongLongValueForDoubleBits(double f) {
    return std::bit_cast<uint64_t>(f);
}

inline double DoubleValueForULongLongBits(uint64_t l) {
    return std::bit_cast<double>(l);
}

// Of a host integer of any sign and size only the low 64 bits count. On failure -1.0, with a TypeError for
// what isn't an integer.
inline double DoubleValueForPyIntBits(nb::handle l) {
    const uint64_t bits = PyLong_AsUnsignedLongLongMask(l.ptr());
    return PyErr_Occurred() != nullptr ? -1.0 : std::bit_cast<double>(bits);
}

}  // namespace codeloom
