// Statements and their parts. `match`, `case`, patterns and type parameters are pseudo nodes: no grammar
// state makes them, the hand-written parsers do.
#pragma once

#include "tree/node.h"

namespace codeloom {

// Base of all statements.
class CStmt : public CNode {};

// `class name(arguments): suite`
class CClassdefStmt : public CStmt {};

// `def name(parameters) -> result: suite`; an `async def` is a rule of its own around it
class CFuncdefStmt : public CStmt {};

// `if a: suite`, `elif` read as `if`, and `else` behind an invented `if`
class CIfStmt : public CStmt {};

// `match subject:`
class CMatchStmt : public CStmt {};

// `case pattern if guard:`
class CCaseStmt : public CStmt {};

// `del a, b`
class CDelStmt : public CStmt {};

// `global a, b`
class CGlobalStmt : public CStmt {};

// `nonlocal a, b`
class CNonlocalStmt : public CStmt {};

// `for target in iterable: suite`
class CForStmt : public CStmt {};

// `with item, item: suite`
class CWithStmt : public CStmt {};

// `pass`
class CPassStmt : public CStmt {};

// `a = b = c`, `a += b`, `a: b = c`
class CExprStmt : public CStmt {};

// `return a`
class CReturnStmt : public CStmt {};

// Type parameters, then the statement that they belong to (PEP 695)
class CWithTypeParameters : public CStmt {};

// `@name(arguments)`
class CSingleDecorator : public CNode {};

// Decorators in a row
class CMultipleDecorators : public CNode {};

// `a as b` in a `with`
class CWithItem : public CNode {};

// `except a as b`
class CExceptClause : public CNode {};

// `: annotation = value` behind the target of an expression statement
class CAnnotatedAssignNode : public CNode {};

// `name`, `*name`, `**name: bound` in a list of type parameters
class CTypeParameter : public CNode {};

// Base of the patterns of a `case`.
class CPatternNode : public CNode {};

// `[a, b]`
class CSequencePatternNode : public CPatternNode {};

// `{"key": a}`
class CMappingPatternNode : public CPatternNode {};

// `name=a` within a class pattern
class CClassArgumentPatternNode : public CPatternNode {};

// `Name(a, name=b)`
class CClassPatternNode : public CPatternNode {};

}  // namespace codeloom
