// Where a lazy import is allowed (PEP 810), and what it may import.
#pragma once

#include "rules/blocks.h"
#include "rules/problem.h"
#include "syntax/nodes.h"

namespace codeloom {

// `from __future__ import a`
bool IsFutureImport(const CTree& tree, const CTreeNode& statement);

// Those of a line: it is one, or has them in its body.
void CheckLazyImports(const CTree& tree, const CBlockTracker& blocks, CProblems& problems);

}  // namespace codeloom
