// What is allowed only in certain places: `return`, `yield`, `await`, `break`, `import *` and the like.
//   in     the tree of a sound line, and the blocks around it
//   out    problems
//   keeps  for each function under way what is only known at its end
// Where blocks are in doubt nothing is said.
#pragma once

#include <cstdint>
#include <vector>

#include "rules/blocks.h"
#include "rules/problem.h"
#include "syntax/language.h"
#include "syntax/nodes.h"
#include "syntax/tree.h"

namespace codeloom {

// What the place of a statement or an expression allows.
struct CPlacement {
    enum class EScope : uint8_t { kModule, kClass, kFunction, kAsyncFunction, kLambda };
    enum class EComprehension : uint8_t { kNone, kDisplay, kGenerator };

    // Blocks that a way out goes through.
    struct CLeft {
        bool except_star = false;
        bool finally = false;
    };

    EScope scope = EScope::kModule;
    bool in_loop = false;
    CLeft left_by_return = {};  // up to the function
    CLeft left_by_jump = {};    // up to the loop
    int depth = 0;

    // The innermost comprehension, and the one to blame where it is asynchronous: null where it may be.
    EComprehension comprehension = EComprehension::kNone;
    const CTreeNode* blamed = nullptr;
    // The same around it, for the first iterable, which is read there.
    EComprehension outer_comprehension = EComprehension::kNone;
    const CTreeNode* outer_blamed = nullptr;
    bool in_first_clause = false;

    bool IsInFunction() const { return scope >= EScope::kFunction; }
    void Enter(EClause clause);
};

// What came before a line, as far as it matters for all that follow.
struct CBeginning {
    bool is_past_futures = false;
    bool has_statement = false;
    bool has_futures = false;  // an import from `__future__` came
    bool has_future_annotations = false;
    ECode misplaced = ECode::kInvalidSyntax;  // reported in the block under way

    bool operator==(const CBeginning&) const = default;
};

class CPlacementRules {
  public:
    CPlacementRules(const CLanguage& language, CProblems& problems)
        : _fLanguage(language), _fProblems(problems) {}

    // Call for every line but comments, in order, once its block is known.
    void Enter(const CBlockTracker& blocks) {
        if (!blocks.HaveChanged()) return;
        _fIsPlaceKnown = false;
        const EClause innermost = blocks.Innermost().clause;
        ECode& misplaced = _fBeginning.misplaced;
        if (misplaced != ECode::kOutsideFunction || IsScope(innermost)) misplaced = ECode::kInvalidSyntax;
        if (!_fFunctions.empty() || _OpensStrict(innermost)) _TrackFunctions(blocks.Blocks());
    }

    // False for most lines: nothing in them depends on where they are.
    bool MayBreak(const CRawLogical& part) const {
        return part.MayHaveWords(kWordsOfInterest) || !_fBeginning.is_past_futures;
    }

    // Then call this; `tree` is null for one with a fault.
    void Check(const CRawLogical& logical, const CTree* tree, const CBlockTracker& blocks);

    // An expression embedded in the line that was checked last.
    void CheckEmbedded(const CTree& tree, const CBlockTracker& blocks);

    // Annotations aren't evaluated where they are: since 3.14 (PEP 649), or by `from __future__` (PEP 563),
    // where they are judged since 3.10.
    bool DefersAnnotations() const {
        return _fLanguage.version >= 314 || (_fBeginning.has_future_annotations && _fLanguage.version >= 310);
    }

    // Call once, after the last line.
    void Finish() { _TrackFunctions({}); }

    // What to go on from where no function is under way.
    const CBeginning& Beginning() const { return _fBeginning; }
    void Resume(const CBeginning& beginning) { _fBeginning = beginning; }

  private:
    // Words without which a line has nothing that depends on its place.
    static constexpr uint64_t kWordsOfInterest =
        WordBits(EWord::kReturn, EWord::kYield, EWord::kAwait, EWord::kAsync, EWord::kBreak, EWord::kContinue,
                 EWord::kNonlocal, EWord::kFrom, EWord::kLazy);

    // A function whose body is under way and must not both yield and return a value.
    struct CStrictFunction {
        size_t block_i;  // of its body among the blocks around a line
        uint32_t header_start = 0;
        CSpan first_yield;   // empty where it has none
        CSpan first_return;  // of a value
    };

    const CPlacement& _PlaceIn(const CBlockTracker& blocks);
    void _TrackFunctions(const std::vector<CBlock>& blocks);
    void _EndFunction(const CStrictFunction& function);
    bool _IsStrict(CPlacement::EScope scope) const;
    bool _OpensStrict(EClause clause) const {
        return (clause == EClause::kAsyncDef || clause == EClause::kDef) &&
               _IsStrict(clause == EClause::kDef ? CPlacement::EScope::kFunction
                                                 : CPlacement::EScope::kAsyncFunction);
    }
    void _CheckFuture(const CTreeNode& statement, const CBlockTracker& blocks);
    void _CheckFeature(const CTreeNode& name);
    void _Visit(const CTreeNode& node, CPlacement place);
    void _VisitChildren(const CTreeNode& node, const CPlacement& place);
    void _VisitAfterKeyword(const CTreeNode& node, const CPlacement& place);
    void _VisitPlainNode(const CTreeNode& node, const CPlacement& place);
    void _VisitAsync(const CTreeNode& node, const CPlacement& place);
    void _VisitDefinition(const CTreeNode& node, const CPlacement& place, CPlacement::EScope body_scope);
    void _VisitLoop(const CTreeNode& node, const CPlacement& place);
    void _VisitLambda(const CTreeNode& node, const CPlacement& place);
    void _VisitAtom(const CTreeNode& node, CPlacement place);
    void _VisitArgument(const CTreeNode& node, CPlacement place);
    void _EnterDisplay(const CTreeNode& atom, CPlacement& place) const;
    void _EnterGenerator(CPlacement& place) const;
    void _VisitComprehension(const CTreeNode& node, const CPlacement& place);
    void _CheckReturn(const CTreeNode& node, const CPlacement& place);
    void _CheckYield(const CTreeNode& node, const CPlacement& place);
    void _CheckKeyword(const CTreeNode& leaf, const CPlacement& place);
    void _CheckAwait(const CTreeNode& leaf, const CPlacement& place);
    void _CheckJump(const CTreeNode& leaf, const CPlacement& place);
    void _CheckImportStar(const CTreeNode& node, const CPlacement& place);
    void _CheckNonlocal(const CTreeNode& node, const CPlacement& place);
    bool _CheckWayOut(const CPlacement::CLeft& left, const CSpan& span, std::string_view word);
    void _ReportAsyncDisplay(const CPlacement& place);
    void _Report(ECode code, const CSpan& span, std::string message);
    void _ReportMisplaced(ECode code, const CSpan& span, std::string message);

    const CLanguage& _fLanguage;
    CProblems& _fProblems;
    const CTree* _fTree = nullptr;
    std::vector<CStrictFunction> _fFunctions;  // by depth; only those whose body is under way
    CPlacement _fPlace;                        // what the blocks around the line allow, once it is known
    bool _fIsPlaceKnown = false;
    CBeginning _fBeginning;
    const std::vector<CBlock>* _fBlocks = nullptr;  // around the line
    uint32_t _fPlainFunction = UINT32_MAX;          // the header of one that was to be asynchronous
};

}  // namespace codeloom
