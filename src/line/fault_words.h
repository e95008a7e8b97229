// The fault of a line in words and with its place.
#pragma once

#include <string>

#include "syntax/fault.h"
#include "syntax/nodes.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// The logical at fault: `line`, or one that is embedded in it.
const CRawLogical& PartAtFault(const CFault& fault, const CRawLogical& line);

// What the fault is called. Requires: a fault, and not that of a line that is too long.
std::string MessageOf(const CFault& fault, const CRawLogical& line);

// The bytes of the file that the fault is about: those of its token, of the rest of a comment from the place
// in the hint on, or the empty place after the last token.
CSpan PlaceOf(const CFault& fault, const CRawLogical& line);

}  // namespace codeloom
