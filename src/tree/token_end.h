// Where a node ends in the tokens of its logical line.
#pragma once

#include "tree/node.h"

namespace codeloom {

// The index of the token after the node's last one. Any leaf counts, a closing bracket too. TypeError when
// the last leaf's context isn't an integer, ValueError for a tree of the host that contains itself.
Py_ssize_t GetTokenEndIndex(const CNode& node);

// The leaf that is reached by always taking the first child, or the last one. ValueError as above.
CNodeRef FirstLeaf(const CNode& node);
CNodeRef LastLeaf(const CNode& node);

}  // namespace codeloom
