// The rules over one line: what its tree shows, whatever is around the line.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// What the rules must know of the text around a line.
struct CLineSetting {
    bool in_class = false;            // in the body of a class, with a comprehension
    bool defers_annotations = false;  // they aren't evaluated with the statement that they are in
};

// False for most lines: nothing in them is what a rule looks at.
bool MayBreakLineRule(const CTree& tree, const CLanguage& language);

void CheckLine(const CRuleContext& context, const CLineSetting& setting);

}  // namespace codeloom
