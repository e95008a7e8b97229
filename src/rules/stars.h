// Starred expressions where they aren't allowed.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// Requires: the tree has a starred expression.
void CheckStars(const CRuleContext& context);

}  // namespace codeloom
