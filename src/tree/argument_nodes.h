// Arguments of calls and of definitions.
#pragma once

#include "tree/node.h"

namespace codeloom {

// `name=a`, `*a`, `**a`, or a comprehension, in a call
class CSingleUsedArgumentNode : public CNode {};

// `name: annotation`
class CFunctionParameterDef : public CNode {};

// `a, b=1, *c` in a definition
class CDefiningArglistNode : public CNode {};

// `a, b=1, *c` in a call
class CUsedArglistNode : public CNode {};

// `( ... )` behind the name of a function
class CParametersNode : public CNode {};

}  // namespace codeloom
