// Atoms and literals: the leaves that carry text, and what stands in brackets.
#pragma once

#include "tree/expression_nodes.h"

namespace codeloom {

// `(a)`, `[a, b]`, `{a: b}`, and adjacent strings
class CAtom : public CExpression {};

// A name
class CNameLiteral : public CExpression {};

// A keyword
class CKeywordLiteral : public CExpression {};

// A number
class CNumberLiteral : public CExpression {};

// One string literal, with its prefix and quotes
class CStringLiteral : public CExpression {};

}  // namespace codeloom
