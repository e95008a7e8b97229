// The blocks around each logical line, by indentation, and what is wrong with them.
//
// A line at an odd depth is taken as it stands, so that the rows after it aren't blamed:
//   deeper than its block, after no header    it opens a block of unknown kind, or the one last left at this
//   depth between two known depths                  it belongs to the inner of the two, whose odd depth is
//   remembered no deeper than its header                 it belongs to the block around the header; deeper
//   rows after it
//                                             are the block that was missing
// A line with a fault may have been any header: what is deeper belongs to it, and any clause may follow it.
#pragma once

#include <cstdint>
#include <vector>

#include "rules/problem.h"
#include "rules/statement_head.h"
#include "syntax/language.h"
#include "syntax/nodes.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// Columns of an indentation, as the interpreter counts them: tabs to the next multiple of eight, and tabs as
// one column. Both must agree about what is deeper.
struct CIndent {
    int32_t column = 0;
    int32_t alt_column = 0;

    bool operator==(const CIndent&) const = default;
};

struct CBlock {
    CIndent indent;
    int32_t odd_column = -1;   // of lines in it that were dedented to no known depth
    int32_t header_depth = 0;  // deeper than this is within a header in this block
    EClause clause =
        EClause::kSimple;            // of the header; kSimple for the module, and where the header is unknown
    bool is_unknown = false;         // nothing can be said of its header
    bool is_depth_in_doubt = false;  // its first line may have been moved
    bool has_mixed_tabs = false;     // reported once
    CStatementHead header;

    // The statement before, among those directly in the block.
    CStatementHead previous;
    bool may_follow_anything = false;  // the statement before is broken, or lost
    bool is_empty = true;              // no statement yet
    bool is_first = false;             // the statement before is its first one
    bool is_in_doubt = false;          // a fault may have moved what is around it
    bool lacks_block = false;          // a header before has no block yet
    bool is_of_try = false;            // the `else` before is that of a `try`
    EClause lacking_clause = EClause::kSimple;
    uint32_t bare_except_start = 0, bare_except_end = 0;  // of the `try` under way; equal where it has none
    CSpan takes_all;         // in the pattern of a case before that leaves nothing to others; empty for none
    bool has_yield = false;  // of a function's
    CSpan full_header;       // of a function's: the one within that leaves no frame; empty for none
    uint32_t frame_count = 0;  // of the function's blocks that the interpreter keeps a frame for, here

    bool operator==(const CBlock&) const = default;
};

// What is left of the blocks where a statement begins anew, in the module or right in a class of it: no place
// in the text.
struct CBlockState {
    std::vector<CBlock> blocks = {CBlock()};
    bool has_too_many = false;
    bool has_too_many_frames = false;

    bool IsInClass() const { return blocks.size() > 1; }
    bool operator==(const CBlockState&) const = default;
};

class CBlockTracker {
  public:
    CBlockTracker(const CLanguage& language, CProblems& problems)
        : _fLanguage(language), _fProblems(problems) {
        _fBlocks.emplace_back();
    }

    // Finds the block of a line by its indentation, before the line is analysed. Not for comments.
    void Enter(const CRawLogical& logical);

    // The line that was entered last is a `case` whose pattern takes everything by this name.
    void TakeAllCases(const CSpan& name) { _fTakesAll = name; }

    // The line that was entered last holds a `yield`.
    void TakeYield();

    // Notes whether the line that was entered last has a fault of its own.
    void Leave(const CRawLogical& logical, bool has_fault);

    // Call once, after the last line. What is missing at the end is reported at its last token.
    void Finish(const CSpan& last_token);

    // The blocks around the line, the module first.
    const std::vector<CBlock>& Blocks() const { return _fBlocks; }
    const CBlock& Innermost() const { return _fBlocks.back(); }
    // False when they are those of the line before.
    bool HaveChanged() const { return _fHaveChanged; }
    const CStatementHead& Head() const { return _fHead; }

    // How deep the line lies: zero in the module.
    int32_t Depth() const { return static_cast<int32_t>(_fBlocks.size()) - 1; }

    // Nothing can be said about what is around the line: a fault has put it there, or has lost a header.
    bool IsInDoubt() const;

    // The line that was entered last, whose column is given, begins a statement of the module or of a class
    // in it, and no line before it matters from now on but for what State says, and for the blocks that it
    // may reopen.
    bool BeginsAnew(int32_t column) const;
    CBlockState State() const;
    // Goes on from there, at a line that begins anew. `closed` are the blocks that were closed before.
    void Resume(const CBlockState& state, std::vector<CBlock> closed);
    // The blocks that were closed since, by depth of the stack the last one; at column 0 where there is none.
    const std::vector<CBlock>& Closed() const { return _fClosed; }
    // Some line has looked at what was closed, before too.
    bool MayHaveReopened() const { return _fMayHaveReopened; }
    // Some line depends on whether a fault was in the class that it follows, and that was begun before.
    bool FollowsUnknown() const { return _fFollowsUnknown; }
    // Problems from this byte on were taken back.
    uint32_t TakenBackFrom() const { return _fTakenBackFrom; }

  private:
    static constexpr size_t kMostIndents = 100;  // of the interpreter

    CBlock& _Top() { return _fBlocks.back(); }
    void _FindPlace(const CRawLogical& logical);
    void _Place(const CIndent& indent);
    void _PlaceDeeper(const CIndent& indent);
    void _PlaceOut(const CIndent& indent);
    void _Open(const CIndent& indent, EClause clause, bool is_unknown);
    void _OpenOdd(const CIndent& indent);
    const CBlock* _FindClosed(int32_t column) const;
    void _CloseTo(size_t count);
    void _ReportMissingBlock(uint32_t start, uint32_t end);
    bool _CheckTabs(const CIndent& indent);
    void _CheckPending(CBlock& block, uint32_t start, uint32_t end);
    bool _MayBreakClause(const CBlock& block) const;
    bool _BreaksClause(CBlock& block);
    void _CheckClause(CBlock& block);
    void _NoteClause(CBlock& block) const;
    bool _MayFollow(const CBlock& block, EClause clause) const;
    void _CheckExcept(CBlock& block);
    void _CheckCase(CBlock& block);
    uint32_t _FramesOf(const CStatementHead& head) const;
    void _CheckFrames();
    CBlock* _InnermostFunction();
    void _ReportTooManyFrames(const CSpan& place);
    void _DropPlacementSince(uint32_t start);
    CProblem& _Report(ECode code, uint32_t start, uint32_t end, std::string message);

    const CLanguage& _fLanguage;
    CProblems& _fProblems;
    std::string_view _fText;  // of the file
    std::vector<CBlock> _fBlocks;
    std::vector<CBlock> _fClosed;        // by depth of the stack, the last block left there
    std::vector<CBlock> _fClosedBefore;  // the same before a part of the text
    CStatementHead _fHead;               // of the line entered last
    CSpan _fTakesAll;                    // in it
    bool _fHaveChanged = false;
    bool _fIsMidRow = false;
    bool _fHasPlaceProblem = false;
    bool _fHasMixedTabs = false;  // reported for the line
    bool _fOpensBlock = false;    // the line before is a header without a body on its row
    bool _fPreviousHasFault = false;
    bool _fAreInDoubt = false;  // at least one of them
    bool _fHasTooMany = false;
    bool _fHasTooManyFrames = false;
    bool _fMayHaveReopened = false;
    bool _fIsClassUnknown = false;  // the statement before in the module is a class that was begun before
    bool _fFollowsUnknown = false;
    uint32_t _fTakenBackFrom = UINT32_MAX;
};

}  // namespace codeloom
