// The tokenizer's logicals into the host's records.
//   in     a text string
//   out    a list of CLogicalLine
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The logical lines of a text string, in order. Never fails on what the text says.
nb::list GetLogicalsFromText(nb::str text);

}  // namespace codeloom
