// The work that is left on the patterns of a `case`, on hosted trees.
#pragma once

#include "parse/pseudo_node.h"
#include "syntax/pattern_steps.h"

namespace codeloom {

using CPatternNodeMaker = CNodeRef (*)(const std::vector<CNodeRef>& children);
using CPatternStep = TPatternStep<Py_ssize_t, CPatternNodeMaker>;

class CPatternWork : public TPatternWork<CNodeRef, Py_ssize_t, CPatternNodeMaker> {
  public:
    void Build(const CPatternStep& step) {
        const auto first = _fNodes.begin() + step.start_i;
        CNodeRef node = step.maker({first, _fNodes.end()});
        _fNodes.erase(first, _fNodes.end());
        AddNode(std::move(node));
    }
};

}  // namespace codeloom
