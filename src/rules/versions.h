// Forms of the language that the parser takes for every version, though not all versions have them.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// From this version on the parser knows all that is newer.
inline constexpr int kNeedsNoVersionCheck = 312;

// Reports the first form of a line that its version doesn't have.
void CheckVersion(const CRuleContext& context);

}  // namespace codeloom
