// A tree as text, for tests and for those who work on the parser.
//   CReturnStmt 311 @0
//     CKeywordLiteral 1 @0 return
//     CNumberLiteral 2 @1 1
// A node's class, its grammar rule or token type, its first token and its text.
#pragma once

#include <string>

#include "syntax/tree.h"

namespace codeloom {

// Empty for an empty tree.
std::string DumpOf(const CTree& tree);

}  // namespace codeloom
