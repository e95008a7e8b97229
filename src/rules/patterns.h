// The pattern of a `case`.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

void CheckPattern(const CRuleContext& context, const CTreeNode& pattern);

// The name or the `_` by which the pattern of a `case` without a guard takes everything; null for any other
// statement.
const CTreeNode* TakesAllCases(const CTree& tree, const CTreeNode& statement);

// What is wrong where something comes after a pattern that takes everything.
std::string WordsOfUnreachable(std::string_view name);

}  // namespace codeloom
