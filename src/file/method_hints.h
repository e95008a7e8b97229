// The hint of a method in a comment, which may leave out the first argument.
#pragma once

#include <cstddef>

#include "names/records.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// Gives each hint in the records of a line, which are those from `first` on, to the argument that it is meant
// for, where the line is the header of a method. What sees a single line gives them one argument too early.
void LeaveSelfOut(const CRawLogical& logical, CRecords& records, size_t first);

}  // namespace codeloom
