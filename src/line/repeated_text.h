// How much text the records of a line may repeat.
#pragma once

#include <cstddef>

#include "tokenizer/raw_logical.h"

namespace codeloom {

// The bytes that these come to at the most: the names that chains consist of, `a`, `a.b` and `a.b.c` of
// `a.b.c`; the text of a value for each target that gets it, of a module for each name imported from it, of
// the first argument of `isinstance` for each class. In time proportional to the tokens.
size_t RepeatedText(const CRawLogical& part);

}  // namespace codeloom
