// The arguments of calls and of classes.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// A list of more than one argument, or of one with a comma.
void CheckArguments(const CRuleContext& context, const CTreeNode& list);

// One that isn't a plain expression, by itself.
void CheckArgument(const CRuleContext& context, const CTreeNode& argument);

// `class A(x for x in y)`
void CheckBases(const CRuleContext& context, const CTreeNode& classdef);

}  // namespace codeloom
