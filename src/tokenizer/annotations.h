// Which strings of a logical line are type hints in quotes.
#pragma once

#include <cstddef>
#include <vector>

#include "tokenizer/logical_types.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// Adds to `hints` the indices of the string tokens in places where a hint is expected, in source order: the
// annotations of parameters, results and targets, the bounds of type parameters, and what is subscripted in
// them. Not within `Literal[...]`, calls and dictionaries, and within `Annotated[...]` only in the first
// place.
void FindHintStrings(const CRawLogical& logical, std::vector<size_t>& hints);

// The same for the tokens of a hint in quotes, which may hold further ones.
void FindNestedHintStrings(const CRawLogical& hint, std::vector<size_t>& hints);

}  // namespace codeloom
