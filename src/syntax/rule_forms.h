// The forms that the nodes of a grammar rule show.
#pragma once

#include <string_view>

#include "syntax/forms.h"
#include "syntax/tree.h"

namespace codeloom {

struct CRuleForm {
    std::string_view rule;
    const CForm* form;
    // The child at fault; null when the node hasn't the form.
    const CTreeNode* (*find)(const CTree& tree, const CTreeNode& node);
};

// The form of a rule; null for a rule whose nodes are the same in all versions.
const CRuleForm* RuleFormOf(std::string_view rule);

}  // namespace codeloom
