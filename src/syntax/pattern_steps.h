// The work that is left on the patterns of a `case`.
//   in     the parts of a pattern in the order of the text, as a descent into it meets them
//   out    the next step to take, and at last the node
// The parts of a pattern are put down here instead of being called for, so that nesting of the text costs
// steps and no call depth. Parsers of plain and of hosted trees share it.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

namespace codeloom {

enum class EPatternStep : uint8_t {
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
    kFail,         // refuse the token at start_i
    kBuild,        // make a node of the nodes from start_i on
};

// Maker says what is built.
template <class Index, class Maker>
struct TPatternStep {
    using EKind = EPatternStep;

    EKind kind;
    Index start_i;
    Index end_i = 0;
    bool allow_as = true;
    Maker maker = {};
};

template <class Node, class Index, class Maker>
class TPatternWork {
  public:
    using CStep = TPatternStep<Index, Maker>;
    using EKind = EPatternStep;

    // While it lives, steps are put down in the order of the text.
    class CPlan {
      public:
        explicit CPlan(TPatternWork& work)
            : _fWork(work),
              _fFirstStep(static_cast<ptrdiff_t>(work._fSteps.size())),
              _fFirstChild(static_cast<Index>(work._fNodes.size())) {}
        ~CPlan() { std::reverse(_fWork._fSteps.begin() + _fFirstStep, _fWork._fSteps.end()); }
        CPlan(const CPlan&) = delete;
        CPlan& operator=(const CPlan&) = delete;

        void Part(EKind kind, Index start_i, Index end_i) { _Add({kind, start_i, end_i}); }
        void Pattern(Index start_i, Index end_i, bool allow_as = true) {
            _Add({EKind::kPattern, start_i, end_i, allow_as});
        }
        void Token(Index tok_i) { _Add({EKind::kToken, tok_i}); }
        void TokenBefore(Index tok_i) { _Add({EKind::kTokenBefore, tok_i}); }
        void Fail(Index tok_i) { _Add({EKind::kFail, tok_i}); }

        // A node of all the parts of this plan.
        void Build(Maker maker) { _Add({EKind::kBuild, _fFirstChild, 0, true, maker}); }

      private:
        void _Add(const CStep& step) { _fWork._fSteps.push_back(step); }

        TPatternWork& _fWork;
        const ptrdiff_t _fFirstStep;
        const Index _fFirstChild;
    };

    bool IsDone() const { return _fSteps.empty(); }
    CStep TakeStep() {
        const CStep step = _fSteps.back();
        _fSteps.pop_back();
        return step;
    }

    void AddNode(Node node) { _fNodes.push_back(std::move(node)); }
    void AddNodeBeforeLast(Node node) {
        AddNode(std::move(node));
        std::iter_swap(_fNodes.end() - 2, _fNodes.end() - 1);
    }
    const Node& Result() const { return _fNodes.back(); }

  protected:
    std::vector<CStep> _fSteps;  // the next one last
    std::vector<Node> _fNodes;   // finished, and not yet part of another
};

}  // namespace codeloom
