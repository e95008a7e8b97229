// The forms that a rule's nodes in a plain tree show.
#pragma once

#include "syntax/rule_forms.h"
#include "syntax/tree.h"

namespace codeloom {

// A node as the table of forms asks for it.
class CFormNode {
  public:
    CFormNode(const CTree& tree, const CTreeNode& node) : _fTree(tree), _fNode(node) {}

    int32_t Count() const { return static_cast<int32_t>(_fNode.child_count); }
    bool HasSign(int32_t i, const CFormSign& sign) const {
        return i < Count() && _Child(i).IsLeaf() && _Child(i).symbol == sign.type;
    }
    template <EFormPart part>
    bool Has(int32_t i) const {
        return i < Count() && _Child(i).Is(_KindOf(part));
    }
    template <EFormPart>
    CFormNode Part(int32_t i) const {
        return {_fTree, _Child(i)};
    }

  private:
    static constexpr ENodeKind _KindOf(EFormPart part) {
        return part == EFormPart::kNamed  ? ENodeKind::kNamedExpr
               : part == EFormPart::kStar ? ENodeKind::kStar
                                          : ENodeKind::kTestList;
    }
    const CTreeNode& _Child(int32_t i) const { return _fTree.Child(_fNode, static_cast<uint32_t>(i)); }

    const CTree& _fTree;
    const CTreeNode& _fNode;
};

using CRuleForm = TRuleForm<CFormNode>;

// The form of a rule; null for a rule whose nodes are the same in all versions.
inline const CRuleForm* RuleFormOf(std::string_view rule) {
    for (const CRuleForm& form : kRuleForms<CFormNode>)
        if (form.rule == rule) return &form;
    return nullptr;
}

}  // namespace codeloom
