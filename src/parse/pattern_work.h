// The work that is left on the patterns of a `case`.
//   in     the parts of a pattern in the order of the text, as a descent into it meets them
//   out    the next step to take, and at last the node
// The parts of a pattern are put down here instead of being called for, so that nesting of the text costs
// steps and no call depth.
#pragma once

#include <algorithm>
#include <vector>

#include "parse/pseudo_node.h"

namespace codeloom {

struct CPatternStep {
    enum class EKind {
        // Plan a node of this kind for the range.
        kPattern,
        kClassPattern,
        kClassArgument,
        kDottedName,
        kNumber,
        kSequence,
        kMapping,
        kToken,        // make the leaf of the token at start_i
        kTokenBefore,  // the same, and put it before the node that was made last
        kFail,         // raise a ParseError at start_i
        kBuild,        // make a node of the nodes from start_i on
    };

    EKind kind;
    Py_ssize_t start_i;
    Py_ssize_t end_i = 0;
    bool allow_as = true;
    CNodeRef (*build)(const std::vector<CNodeRef>& children) = nullptr;
};

class CPatternWork {
  public:
    using EKind = CPatternStep::EKind;

    // While it lives, steps are put down in the order of the text.
    class CPlan {
      public:
        explicit CPlan(CPatternWork& work)
            : _fWork(work), _fFirstStep(work._fSteps.size()), _fFirstChild(work._fNodes.size()) {}
        ~CPlan() {
            std::reverse(_fWork._fSteps.begin() + static_cast<Py_ssize_t>(_fFirstStep), _fWork._fSteps.end());
        }
        CPlan(const CPlan&) = delete;
        CPlan& operator=(const CPlan&) = delete;

        void Part(EKind kind, Py_ssize_t start_i, Py_ssize_t end_i) { _Add({kind, start_i, end_i}); }
        void Pattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as = true) {
            _Add({EKind::kPattern, start_i, end_i, allow_as});
        }
        void Token(Py_ssize_t tok_i) { _Add({EKind::kToken, tok_i}); }
        void TokenBefore(Py_ssize_t tok_i) { _Add({EKind::kTokenBefore, tok_i}); }
        void Fail(Py_ssize_t tok_i) { _Add({EKind::kFail, tok_i}); }

        // A node of all the parts of this plan.
        template <class Node>
        void Build() {
            _Add({EKind::kBuild, static_cast<Py_ssize_t>(_fFirstChild), 0, true, &NewPseudoNode<Node>});
        }

      private:
        void _Add(const CPatternStep& step) { _fWork._fSteps.push_back(step); }

        CPatternWork& _fWork;
        const size_t _fFirstStep;
        const size_t _fFirstChild;
    };

    bool IsDone() const { return _fSteps.empty(); }
    CPatternStep TakeStep() {
        const CPatternStep step = _fSteps.back();
        _fSteps.pop_back();
        return step;
    }

    void AddNode(CNodeRef node) { _fNodes.push_back(std::move(node)); }
    void AddNodeBeforeLast(CNodeRef node) {
        _fNodes.push_back(std::move(node));
        std::iter_swap(_fNodes.end() - 2, _fNodes.end() - 1);
    }
    void Build(const CPatternStep& step) {
        const auto first = _fNodes.begin() + step.start_i;
        CNodeRef node = step.build({first, _fNodes.end()});
        _fNodes.erase(first, _fNodes.end());
        AddNode(std::move(node));
    }
    CNodeRef Result() const { return _fNodes.back(); }

  private:
    std::vector<CPatternStep> _fSteps;  // the next one last
    std::vector<CNodeRef> _fNodes;      // finished, and not yet part of another
};

}  // namespace codeloom
