// What a line with a fault evidently binds, by its tokens.
#pragma once

#include <vector>

#include "rules/statement_head.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

struct CLostBindings {
    std::vector<const CRawToken*> names;       // in the scope around the line
    std::vector<const CRawToken*> parameters;  // in the scope that its header opens
};

// The names of definitions and their parameters, what comes before `=`, after `as`, between `for` and `in`,
// and what is imported. The names of the line lead from the tokens, which must outlive them.
CLostBindings FindLostBindings(const CRawLogical& line, EClause clause);

}  // namespace codeloom
