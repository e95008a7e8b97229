// Expressions embedded in a line: their errors and records, moved to the line that they are in.
#pragma once

#include <nanobind/nanobind.h>

#include "neighbours/logicalline/logical_line.h"

namespace codeloom {

// Makes the SyntaxError for a token `context` of an embedded logical, with its row in the frame of `logical`.
// The column stays relative to the embedded text.
nb::object EmbeddedError(const CLogicalLine& logical, const CLogicalLine& exp_logical, nb::handle context);

// Appends the type equivs of an embedded logical to those of the line around it.
void LiftTypeEquivs(const CLogicalLine& exp_logical, CLogicalLine& logical);

}  // namespace codeloom
