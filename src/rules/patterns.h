// The pattern of a `case`.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

void CheckPattern(const CRuleContext& context, const CTreeNode& pattern);

}  // namespace codeloom
