// What a line has that is newer than the version that it is written in, and what later versions have dropped.
//   in     the version, each node that is made, and what is read by hand
//   out    one SyntaxError which names the form, its place and the version that brought it
#pragma once

#include <cstdint>
#include <vector>

#include <nanobind/nanobind.h>

#include "neighbours/logicalline/logical_line.h"
#include "syntax/rule_forms.h"
#include "tree/child_list.h"
#include "tree/expression_nodes.h"
#include "tree/node.h"

namespace codeloom {

// A node as the table of forms asks for it.
class CHostedFormNode {
  public:
    explicit CHostedFormNode(const CNode& node) : _fNode(node) {}

    int32_t Count() const { return static_cast<int32_t>(ListedCount(_fNode)); }
    bool HasSign(int32_t i, const CFormSign& sign) const { return _fNode.IsToken(i, sign.text); }
    template <EFormPart part>
    bool Has(int32_t i) const {
        return _TryPart<part>(i) != nullptr;
    }
    template <EFormPart part>
    CHostedFormNode Part(int32_t i) const {
        return CHostedFormNode(*_TryPart<part>(i));
    }

  private:
    template <EFormPart part>
    const CNode* _TryPart(int32_t i) const {
        if constexpr (part == EFormPart::kNamed) return _fNode.TryChild<CNamedExpr>(i);
        if constexpr (part == EFormPart::kStar) return _fNode.TryChild<CStarExpression>(i);
        if constexpr (part == EFormPart::kList) return _fNode.TryChild<CTestListStarExpr>(i);
    }

    const CNode& _fNode;
};

class CExtendedForms {
  public:
    // Without a version of two integers at least, nothing is newer.
    void SetVersion(nb::handle version_triple);

    // `number_of_state` gives the number of a grammar state, or -1.
    template <class NumberOfState>
    void WatchStates(NumberOfState number_of_state);

    void Reset() { _fFound = nullptr; }
    void Note(const CForm& form, nb::handle context);
    bool IsNewer(const CForm& form) const { return form.version > _fVersion; }

    // True for nodes that NoteNode is to look at.
    bool AreWatched(int type) const {
        return static_cast<size_t>(type) < _fWatched.size() && _fWatched[static_cast<size_t>(type)];
    }
    void NoteNode(int type, const CNode& node);

    bool HasFound() const { return _fFound != nullptr; }

    // The SyntaxError about the first form that was found.
    nb::object ErrorIn(CLogicalLine& logical) const;

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fContext);
    }

  private:
    using CNodeForm = TRuleForm<CHostedFormNode>;

    void _Watch(int type, const CNodeForm* form);

    int _fVersion = INT32_MAX;
    std::vector<uint8_t> _fWatched;            // by node type, whether nodes of it are looked at
    std::vector<const CNodeForm*> _fNodeForm;  // by node type; none for strings
    const CForm* _fFound = nullptr;
    nb::object _fContext = nb::none();  // of what was found: a token's index, or its position
};

template <class NumberOfState>
void CExtendedForms::WatchStates(NumberOfState number_of_state) {
    for (const CNodeForm& form : kRuleForms<CHostedFormNode>)
        if (form.form->version > _fVersion) _Watch(number_of_state(form.rule), &form);
}

}  // namespace codeloom
