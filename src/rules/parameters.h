// Parameters of functions, and type parameters.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// `parameters` as ForEachParameter takes them.
void CheckParameters(const CRuleContext& context, const CTreeNode& parameters);

// A statement with its type parameters.
void CheckTypeParameters(const CRuleContext& context, const CTreeNode& statement);

// `yield`, `await` and `:=` in an expression that is evaluated on demand; `where` says in what.
// Annotations that aren't evaluated where they are.
void CheckAnnotations(const CRuleContext& context);

void CheckDeferred(const CRuleContext& context, const CTreeNode& expression, std::string_view where);

}  // namespace codeloom
