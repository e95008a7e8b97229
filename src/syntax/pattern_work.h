// The work that is left on the patterns of a `case`.
//   in     the parts of a pattern in the order of the text, as a descent into it meets them
//   out    the next step to take, and at last the node
// The parts of a pattern are put down here instead of being called for, so that nesting of the text costs
// steps and no call depth.
#pragma once

#include <algorithm>
#include <vector>

#include "syntax/tree.h"

namespace codeloom {

struct CCasePatternStep {
    enum class EKind : uint8_t {
        // Plan a node of this kind for the range.
        kPattern,
        kClassPattern,
        kClassArgument,
        kDottedName,
        kNumber,
        kSequence,
        kMapping,
        kToken,  // make the leaf of the token at start_i
        kFail,   // refuse the token at start_i
        kBuild,  // make a node of the nodes from start_i on
    };

    EKind kind;
    uint32_t start_i;
    uint32_t end_i = 0;
    bool allow_as = true;
    ENodeKind node_kind = ENodeKind::kNode;  // of what is built
};

class CCasePatternWork {
  public:
    using EKind = CCasePatternStep::EKind;

    // While it lives, steps are put down in the order of the text.
    class CPlan {
      public:
        explicit CPlan(CCasePatternWork& work)
            : _fWork(work),
              _fFirstStep(work._fSteps.size()),
              _fFirstChild(static_cast<uint32_t>(work._fNodes.size())) {}
        ~CPlan() {
            std::reverse(_fWork._fSteps.begin() + static_cast<ptrdiff_t>(_fFirstStep), _fWork._fSteps.end());
        }
        CPlan(const CPlan&) = delete;
        CPlan& operator=(const CPlan&) = delete;

        void Part(EKind kind, uint32_t start_i, uint32_t end_i) { _Add({kind, start_i, end_i}); }
        void Pattern(uint32_t start_i, uint32_t end_i, bool allow_as = true) {
            _Add({EKind::kPattern, start_i, end_i, allow_as});
        }
        void Token(uint32_t tok_i) { _Add({EKind::kToken, tok_i}); }
        void Fail(uint32_t tok_i) { _Add({EKind::kFail, tok_i}); }

        // A node of all the parts of this plan.
        void Build(ENodeKind kind) { _Add({EKind::kBuild, _fFirstChild, 0, true, kind}); }

      private:
        void _Add(const CCasePatternStep& step) { _fWork._fSteps.push_back(step); }

        CCasePatternWork& _fWork;
        const size_t _fFirstStep;
        const uint32_t _fFirstChild;
    };

    void Begin(const CCasePatternStep& first) {
        _fSteps.assign(1, first);
        _fNodes.clear();
    }
    bool IsDone() const { return _fSteps.empty(); }
    CCasePatternStep TakeStep() {
        const CCasePatternStep step = _fSteps.back();
        _fSteps.pop_back();
        return step;
    }

    void AddNode(const CTreeNode& node) { _fNodes.push_back(node); }
    void Build(const CCasePatternStep& step, CTree& tree) {
        const auto children = std::span<const CTreeNode>(_fNodes).subspan(step.start_i);
        const CTreeNode node = tree.AddParent(step.node_kind, 0, children.front().token, children);
        _fNodes.resize(step.start_i);
        AddNode(node);
    }
    const CTreeNode& Result() const { return _fNodes.back(); }

  private:
    std::vector<CCasePatternStep> _fSteps;  // the next one last
    std::vector<CTreeNode> _fNodes;         // finished, and not yet part of another
};

}  // namespace codeloom
