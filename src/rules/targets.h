// What can be assigned, augmented, annotated, deleted, and bound by `for`, `with`, `as` and `:=`.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// What an assignment statement binds, and what any other statement does.
enum class ETargetUse : uint8_t { kStatement, kAssign, kDelete };

// One mark per target.
void CheckTarget(const CRuleContext& context, const CTreeNode& target, ETargetUse use);

// The name of what is defined or imported, a parameter or a keyword argument.
void CheckBoundName(const CRuleContext& context, const CTreeNode& name);

void CheckAssignment(const CRuleContext& context, const CTreeNode& statement);
void CheckImportedNames(const CRuleContext& context, const CTreeNode& names);

// `a := b` as an expression or an argument.
void CheckWalrus(const CRuleContext& context, const CTreeNode& named);

}  // namespace codeloom
