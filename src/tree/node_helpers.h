// Questions about nodes that no single class answers.
#pragma once

#include <optional>
#include <vector>

#include "tree/atom_nodes.h"

namespace codeloom {

// `a` for `(a)` and `((a))`; the node itself for anything else, a tuple and a generator in parentheses
// included.
CNodeRef DropSimpleParens(CNode& node);

// The elements of a tuple in parentheses, `(a, b)` or `()`; nothing for any other node. A generator has one
// element, which is empty.
std::optional<std::vector<CNodeRef>> ExpandSeqLiteral(CNode& node);

// True for a name and for a chain of names, `a.b.c`; for the first of them in parentheses too.
bool IsDottedName(CNode& node);

// The same for an atom and the trailers after it.
bool IsDottedChain(const CChainParts& chain);

// True for `{a, b}`.
bool IsSetLiteral(CAtom& atom_node);

// True for `(a for b in c)` under a grammar that doesn't wrap the `for` in a node of its own.
bool IsGenExpression(CAtom& atom_node);

// True for a tuple, in any number of parentheses or in none.
bool IsTupleLiteralNode(CNode& node);

void BindNodeHelpers(nb::module_& module);

}  // namespace codeloom
