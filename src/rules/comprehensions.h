// `:=` and `yield` within comprehensions.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// Requires: the tree has a comprehension. `in_class` where the line itself is in the body of a class.
void CheckComprehensions(const CRuleContext& context, bool in_class);

}  // namespace codeloom
