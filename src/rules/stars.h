// Starred expressions where they can't stand.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// Requires: the tree has a starred expression.
void CheckStars(const CRuleContext& context);

}  // namespace codeloom
