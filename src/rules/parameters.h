// Parameters of functions, and type parameters.
#pragma once

#include <vector>

#include "rules/rule_context.h"

namespace codeloom {

// `parameters` as ForEachParameter takes them.
void CheckParameters(const CRuleContext& context, const CTreeNode& parameters);

// A statement with its type parameters.
void CheckTypeParameters(const CRuleContext& context, const CTreeNode& statement);

// Annotations that aren't evaluated where they are.
void CheckAnnotations(const CRuleContext& context);

// The annotations of a line that has fields of f-strings to check, which are trees of their own.
std::vector<CSpan> AnnotationsWithFields(const CTree& tree);
void CheckFieldInAnnotation(const CRuleContext& context);

// `yield`, `await` and `:=` in an expression that is evaluated on demand; `where` says in what.
void CheckDeferred(const CRuleContext& context, const CTreeNode& expression, std::string_view where);

}  // namespace codeloom
