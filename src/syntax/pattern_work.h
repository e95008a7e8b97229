// The work that is left on the patterns of a `case`, on plain trees.
#pragma once

#include "syntax/pattern_steps.h"
#include "syntax/tree.h"

namespace codeloom {

using CCasePatternStep = TPatternStep<uint32_t, ENodeKind>;

class CCasePatternWork : public TPatternWork<CTreeNode, uint32_t, ENodeKind> {
  public:
    void Begin(const CCasePatternStep& first) {
        _fSteps.assign(1, first);
        _fNodes.clear();
    }

    void Build(const CCasePatternStep& step, CTree& tree) {
        const auto children = std::span<const CTreeNode>(_fNodes).subspan(step.start_i);
        const CTreeNode node = tree.AddParent(step.maker, 0, children.front().token, children);
        _fNodes.resize(step.start_i);
        AddNode(node);
    }
};

}  // namespace codeloom
