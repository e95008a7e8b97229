// Expressions: operators, chains of trailers, comprehensions, yields. Each class shows the source that it
// stands for. A node of a class is proof that the optional part of its rule was there: a lone child takes its
// parent's place.
#pragma once

#include "tree/node.h"

namespace codeloom {

// Base of all expressions, and the class of a state whose class isn't known.
class CExpression : public CNode {};

// `a if condition else b`
class CIfElseExpression : public CExpression {};

// `not a`, `a or b`, `a + b - c`, `a < b`
class COperatorExpression : public CExpression {};

// `*a` as an expression, not in a declaration of arguments
class CStarExpression : public CExpression {};

// `a.b.c` in decorators and imports
class CDottedName : public CExpression {};

// `lambda x: y`
class CLambdaExpr : public CExpression {};

// Declared for hosts; no rule makes one.
class CTestExpr : public CExpression {};

// `yield`, `yield a`, `yield from a`
class CYieldExpr : public CExpression {};

// `a, b` and `a,`: comma lists of expressions
class CTestListStarExpr : public CExpression {};

// `await a`, `a.b`, `a(1)[2]`: an atom and its trailers
class CAtomExpr : public CExpression {};

// `a ** b`, and in the 2.7 grammar an atom with its trailers
class CPower : public CExpression {};

// `-a`, `+a`, `~a`
class CFactorExpr : public CExpression {};

// `a := b`
class CNamedExpr : public CExpression {};

// Declared for hosts; no rule makes one.
class CBinaryOp : public CNode {};

// `from a` behind `yield`
class CYieldArg : public CNode {};

// `for x in y` within a comprehension
class CCompForNode : public CNode {};

// The contents of a list display in the 2.7 grammar
class CListmakerNode : public CNode {};

// `(...)`, `[...]` or `.name` behind an atom
class CTrailer : public CNode {};

}  // namespace codeloom
