// The base of the statement classes.
#pragma once

#include "tree/node.h"

namespace codeloom {

// Base of all statements but the imports. A compound statement is its header here, with the body only where
// it is on the same logical line; elsewhere the body is a `pass` that the parser invents.
class CStmt : public CNode {};

}  // namespace codeloom
