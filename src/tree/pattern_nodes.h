// The patterns of a `case`. No grammar state makes them: the parser of `match` and `case` does. They have no
// operations; the walkers read their children.
#pragma once

#include "tree/node.h"

namespace codeloom {

// `a as b`, `a | b`, `(a)`, `*a`, `-1 + 2j`, and the base of the other patterns
//   child    pattern  'as'  name
//   child    pattern  '|'  pattern  '|'  pattern ...
//   child    '('  pattern  ')'
//   child    '*'  name
//   child    [sign]  number  [operator  number]
class CPatternNode : public CNode {};

// `[a, b]`, `(a, b)`, and `{"key": a, **b}` too, which has no commas among its children
//   child    '['  pattern  ','  pattern ...  ']'
//   child    '{'  key  ':'  pattern  key  ':'  pattern ...  '**'  pattern  '}'
class CSequencePatternNode : public CPatternNode {};

// Declared for hosts; a mapping is a CSequencePatternNode.
class CMappingPatternNode : public CPatternNode {};

// `name=a` within a class pattern
//   child    name  '='  pattern
class CClassArgumentPatternNode : public CPatternNode {};

// `Name(a, name=b)`; the closing bracket isn't among the children
//   child    name  '('  pattern  ','  pattern ...
class CClassPatternNode : public CPatternNode {};

}  // namespace codeloom
