// The rules for one text: what is around its lines, and what is allowed where.
#pragma once

#include <vector>

#include "rules/blocks.h"
#include "rules/line_rules.h"
#include "rules/placement.h"
#include "rules/problem.h"
#include "syntax/language.h"
#include "syntax/tree_observer.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// What of the lines before matters where a statement begins anew, in the module or right in a class of it.
struct CCheckState {
    CBlockState blocks = {};
    CBeginning beginning = {};

    bool operator==(const CCheckState&) const = default;
};

class CTextChecker final : public CTreeObserver {
  public:
    // Both must outlive the checker.
    CTextChecker(const CLanguage& language, CProblems& problems)
        : _fLanguage(language),
          _fProblems(problems),
          _fBlocks(language, problems),
          _fPlacement(language, problems) {}

    // Call for every line in order, before its analysis, which hands its trees over, and after that.
    void Enter(const CRawLogical& logical);
    void Take(const CRawLogical& part, const CTree& tree) override {
        if (MayBreakLineRule(tree, _fLanguage) || _fPlacement.MayBreak(part) || !part.embedded.empty())
            _Check(part, tree);
    }
    void Leave(const CRawLogical& logical, bool has_fault);

    // Call once, after the last line.
    void Finish();

    const CBlockTracker& Blocks() const { return _fBlocks; }

    // As it was before the line that was entered last, which begins anew; and to go on from there.
    CCheckState State() const { return {_fBlocks.State(), _fPlacement.Beginning()}; }
    void Resume(const CCheckState& state, std::vector<CBlock> closed) {
        _fBlocks.Resume(state.blocks, std::move(closed));
        _fPlacement.Resume(state.beginning);
    }

  private:
    // A function of its own, so that most lines pay only for the question.
    [[gnu::noinline]] void _Check(const CRawLogical& part, const CTree& tree);
    CLineSetting _Setting(const CTree& tree) const;
    void _CheckField(const CRawLogical& part, const CTree& tree);

    const CLanguage& _fLanguage;
    CProblems& _fProblems;
    CBlockTracker _fBlocks;
    CPlacementRules _fPlacement;
    CNameSet _fNames;                     // storage that stays
    const CRawLogical* _fLine = nullptr;  // under way
    size_t _fFirstProblem = 0;            // of what its trees show
    CSpan _fLastToken;                    // of the last line
    std::vector<CSpan> _fAnnotations;     // of the line, where they hold fields to check
};

}  // namespace codeloom
