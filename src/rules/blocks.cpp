#include "rules/blocks.h"

#include <algorithm>
#include <string>
#include <utility>

#include "text/scan.h"

namespace codeloom {

namespace {

constexpr int32_t kTabSize = 8;

CIndent MeasureIndent(std::string_view blanks) {
    CIndent indent;
    for (const char c : blanks) {
        if (c == ' ') {
            ++indent.column;
            ++indent.alt_column;
        } else if (c == '\t') {
            indent.column = (indent.column / kTabSize + 1) * kTabSize;
            ++indent.alt_column;
        } else if (c == '\f') {
            indent = {};
        }
    }
    return indent;
}

bool HasTabs(const CIndent& indent) {
    return indent.column != indent.alt_column;
}

// What is on its later rows may be lines of their own.
bool SpansRows(const CRawLogical& logical) {
    const uint32_t start = logical.StartOf(logical.tokens.front());
    const uint32_t end = logical.EndOf(logical.tokens.back());
    return logical.file_text.substr(start, end - start).find('\n') != std::string_view::npos;
}

}  // namespace

void CBlockTracker::Enter(const CRawLogical& logical) {
    _fHead = ReadStatementHead(logical);
    _fHasPlaceProblem = _fHasMixedTabs = _fHaveChanged = false;
    _FindPlace(logical);
    if (!_fHead.IsHeader()) return;
    _fText = logical.file_text;
    _fTakesAll = {};
    _CheckFrames();
}

void CBlockTracker::_FindPlace(const CRawLogical& logical) {
    const CRawToken& first = logical.tokens.front();
    if (logical.is_indented_by_spaces) {
        _fIsMidRow = false;
        const CIndent indent{first.position.col, first.position.col};
        if (_fOpensBlock || indent != _Top().indent) _Place(indent);
        return;
    }
    const uint32_t token_start = logical.StartOf(first);
    const uint32_t row_start = token_start - static_cast<uint32_t>(first.position.col);
    const std::string_view before = logical.file_text.substr(row_start, token_start - row_start);
    _fIsMidRow = std::any_of(before.begin(), before.end(), [](char c) { return !IsBlank(c); });
    if (!_fIsMidRow) _Place(MeasureIndent(before));
}

// The frames that the interpreter keeps for a block while it runs.
uint32_t CBlockTracker::_FramesOf(const CStatementHead& head) const {
    constexpr int kCountsHandlerTwice = 309;
    switch (head.clause) {
        case EClause::kFor:
        case EClause::kAsyncFor:
        case EClause::kWhile:
        case EClause::kTry:
        case EClause::kFinally:
            return 1;
        case EClause::kWith:
        case EClause::kAsyncWith:
            return head.with_item_count;
        case EClause::kExcept:
        case EClause::kBareExcept:
        case EClause::kExceptStar:
            if (!_fLanguage.IsPython3()) return 0;
            return _fLanguage.version >= kCountsHandlerTwice ? 2 : 1;
        default:
            return 0;
    }
}

// The interpreter's limit: 20, and from 3.13 on 21, where an `async def` and a generator need one for
// themselves.
void CBlockTracker::_CheckFrames() {
    const bool counts_function = _fLanguage.version >= 313;
    const uint32_t most = counts_function ? 21 : 20;
    const uint32_t count = _Top().frame_count + _FramesOf(_fHead);
    const CSpan place{_fHead.start, _fHead.end};
    if (count > most) return _ReportTooManyFrames(place);
    if (count < most || !counts_function) [[likely]]
        return;
    CBlock* const function = _InnermostFunction();
    if (function == nullptr) return;
    if (function->has_yield) return _ReportTooManyFrames(place);
    function->full_header = place;
}

CBlock* CBlockTracker::_InnermostFunction() {
    const auto found = std::find_if(_fBlocks.rbegin(), _fBlocks.rend(),
                                    [](const CBlock& block) { return block.clause == EClause::kDef; });
    return found == _fBlocks.rend() ? nullptr : &*found;
}

void CBlockTracker::TakeYield() {
    CBlock* const function = _InnermostFunction();
    if (function == nullptr || std::exchange(function->has_yield, true)) return;
    if (function->full_header.end > 0) _ReportTooManyFrames(function->full_header);
}

// Once per text.
void CBlockTracker::_ReportTooManyFrames(const CSpan& place) {
    if (std::exchange(_fHasTooManyFrames, true)) return;
    _Report(ECode::kTooManyBlocks, place.start, place.end, "too many statically nested blocks");
}

void CBlockTracker::_Place(const CIndent& indent) {
    CBlock& top = _Top();
    // As deep as its header only where tabs count eight.
    const bool is_hidden = _fLanguage.IsPython3() && indent.column == top.indent.column &&
                           indent.alt_column > top.indent.alt_column;
    if (_fOpensBlock && (indent.column > top.header_depth || is_hidden)) {
        const bool has_mixed_tabs = !_CheckTabs(indent);
        _Open(indent, top.previous.clause, _fPreviousHasFault);
        _Top().has_mixed_tabs = has_mixed_tabs;
        return;
    }
    if (_fOpensBlock && !_fPreviousHasFault) {
        _ReportMissingBlock(_fHead.start, _fHead.end);
        top.lacks_block = true;
        top.lacking_clause = top.previous.clause;
        top.is_depth_in_doubt |= top.is_first;
        top.has_mixed_tabs |= HasTabs(top.indent);
    }
    if (indent.column > top.indent.column) return _PlaceDeeper(indent);
    if (indent.column < top.indent.column) return _PlaceOut(indent);
    _CheckTabs(indent);
}

void CBlockTracker::_PlaceDeeper(const CIndent& indent) {
    CBlock& top = _Top();
    if (top.lacks_block) {
        top.lacks_block = false;
        return _Open(indent, top.lacking_clause, false);
    }
    if (_fPreviousHasFault) return _Open(indent, EClause::kSimple, true);
    if (!_fHasPlaceProblem) _Report(ECode::kUnexpectedIndent, _fHead.start, _fHead.end, "unexpected indent");
    _fHasPlaceProblem = true;
    _OpenOdd(indent);
}

// A block that no header opens: that of the same depth which was left last, since a line between may have
// lost its indentation, or an unknown one.
void CBlockTracker::_OpenOdd(const CIndent& indent) {
    _fMayHaveReopened = true;
    CBlock& top = _Top();
    top.may_follow_anything = true;
    const int32_t header_depth = top.indent.column;
    const CBlock* const closed = _FindClosed(indent.column);
    if (closed != nullptr && indent.column > header_depth) {
        CBlock reopened = *closed;
        reopened.may_follow_anything = true;
        reopened.is_unknown = true;
        reopened.header_depth = header_depth;
        _fAreInDoubt |= reopened.is_in_doubt;
        _fHaveChanged = true;
        _fBlocks.push_back(std::move(reopened));
        return;
    }
    _Open(indent, EClause::kSimple, true);
    _Top().header_depth = header_depth;
    _Top().has_mixed_tabs = true;  // which may be what is odd
}

const CBlock* CBlockTracker::_FindClosed(int32_t column) const {
    for (size_t i = std::max(_fClosed.size(), _fClosedBefore.size()); i-- > 0;) {
        const bool is_own = i < _fClosed.size() && _fClosed[i].indent.column != 0;
        if (!is_own && i >= _fClosedBefore.size()) continue;
        const CBlock& block = is_own ? _fClosed[i] : _fClosedBefore[i];
        if (block.indent.column == column) return &block;
    }
    return nullptr;
}

void CBlockTracker::_PlaceOut(const CIndent& indent) {
    size_t count = _fBlocks.size();
    while (_fBlocks[count - 1].indent.column > indent.column) --count;
    if (_fBlocks[count - 1].indent.column == indent.column) {
        _CloseTo(count);
        _CheckTabs(indent);
        return;
    }
    // Between the depths of two blocks: taken for the inner one's.
    _CloseTo(count + 1);
    CBlock& inner = _Top();
    if (inner.odd_column == indent.column) return;
    if (std::exchange(inner.is_depth_in_doubt, false)) {
        inner.indent = indent;
        inner.header_depth = indent.column;
        return;
    }
    if (!_fHasPlaceProblem && !_fPreviousHasFault) {
        _DropPlacementSince(inner.header.start);
        _Report(ECode::kUnknownDedent, _fHead.start, _fHead.end,
                "unindent does not match any outer indentation level");
    }
    _fHasPlaceProblem = true;
    inner.has_mixed_tabs |= HasTabs(inner.indent);
    inner.odd_column = indent.column;
    inner.header_depth = std::min(inner.header_depth, indent.column);
    inner.may_follow_anything = true;
}

void CBlockTracker::_Open(const CIndent& indent, EClause clause, bool is_unknown) {
    CBlock& block = _fBlocks.emplace_back();
    const CBlock& outer = *(&block - 1);
    block.indent = indent;
    block.header_depth = indent.column;
    block.clause = clause;
    block.is_unknown = is_unknown;
    block.header = outer.previous;
    block.frame_count = IsScope(clause) ? clause == EClause::kAsyncDef && _fLanguage.version >= 313
                                        : outer.frame_count + _FramesOf(block.header);
    block.has_mixed_tabs = outer.has_mixed_tabs;
    block.is_depth_in_doubt = _fPreviousHasFault || outer.lacks_block;
    _fHaveChanged = true;
    if (_fBlocks.size() > kMostIndents && !std::exchange(_fHasTooMany, true))
        _Report(ECode::kTooManyIndents, _fHead.start, _fHead.end, "too many levels of indentation");
}

void CBlockTracker::_CloseTo(size_t count) {
    while (_fBlocks.size() > count) {
        _fHaveChanged = true;
        _CheckPending(_Top(), _fHead.start, _fHead.end);
        if (_fClosed.size() < _fBlocks.size()) _fClosed.resize(_fBlocks.size());
        _fClosed[_fBlocks.size() - 1] = std::move(_fBlocks.back());
        _fBlocks.pop_back();
    }
}

void CBlockTracker::_ReportMissingBlock(uint32_t start, uint32_t end) {
    const CStatementHead& header = _Top().previous;
    std::string message = "expected an indented block after ";
    message += NameOfStatement(header.clause);
    CProblem& problem = _Report(ECode::kExpectedBlock, start, end, std::move(message));
    problem.related.push_back({header.start, header.end, "the header that lacks its block"});
    _fHasPlaceProblem = true;
}

// False where tabs and blanks disagree about how deep the line lies. Reported once per block.
bool CBlockTracker::_CheckTabs(const CIndent& indent) {
    if (!_fLanguage.IsPython3()) return true;
    CBlock& block = _Top();
    const CIndent& other = block.indent;
    const bool agrees = indent.column == other.column ? indent.alt_column == other.alt_column
                                                      : indent.alt_column > other.alt_column;
    if (agrees || block.has_mixed_tabs || _fHasPlaceProblem || _fPreviousHasFault) return agrees;
    _Report(ECode::kMixedTabs, _fHead.start, _fHead.end,
            "inconsistent use of tabs and spaces in indentation");
    block.has_mixed_tabs = _fHasMixedTabs = true;
    return false;
}

void CBlockTracker::Leave(const CRawLogical& logical, bool has_fault) {
    CBlock& block = _Top();
    const bool is_broken = has_fault;
    if (!has_fault && !_fHasPlaceProblem && _MayBreakClause(block)) has_fault = _BreaksClause(block);
    if (has_fault || _fHasPlaceProblem) {
        const bool may_be_moved = !is_broken || _fHasPlaceProblem || SpansRows(logical);
        for (CBlock& around : _fBlocks) {
            around.may_follow_anything = true;
            around.is_in_doubt |= may_be_moved;
        }
        _fAreInDoubt |= may_be_moved;
    } else if (_fAreInDoubt && IsDefinition(_fHead.clause)) {
        for (CBlock& around : _fBlocks) around.is_in_doubt = false;
        _fAreInDoubt = false;
    }
    if (_fIsMidRow) {
        _fPreviousHasFault |= has_fault;
        return;
    }
    if (Depth() == 0) _fIsClassUnknown = false;
    if (block.bare_except_end != 0 && !IsContinuation(_fHead.clause))
        block.bare_except_start = block.bare_except_end = 0;
    if (_fHead.clause != EClause::kSimple) _NoteClause(block);
    block.is_first = block.is_empty;
    block.is_empty = false;
    block.previous = _fHead;
    block.may_follow_anything = has_fault || (_fHasPlaceProblem && !_fHead.IsHeader());
    if (_fHead.IsHeader() && !_fHasPlaceProblem) block.lacks_block = false;
    _fPreviousHasFault = has_fault || _fHasMixedTabs;  // then its depth isn't known
    _fOpensBlock = _fHead.ends_in_colon || (has_fault && _fHead.IsHeader());
    if (!_fHead.IsHeader() && !has_fault) _fOpensBlock = false;
}

void CBlockTracker::Finish(const CSpan& last_token) {
    const auto [start, end] = last_token;
    _fHead = CStatementHead();
    _fHasPlaceProblem = false;
    if (_fOpensBlock && !_fPreviousHasFault) _ReportMissingBlock(start, end);
    for (size_t i = _fBlocks.size(); i-- > 0;) _CheckPending(_fBlocks[i], start, end);
}

bool CBlockTracker::IsInDoubt() const {
    return std::any_of(_fBlocks.begin(), _fBlocks.end(), [](const CBlock& block) {
        return block.is_unknown || block.lacks_block || block.is_in_doubt;
    });
}

bool CBlockTracker::BeginsAnew(int32_t column) const {
    const CBlock& block = _fBlocks.back();
    const EClause before = block.previous.clause;
    const bool is_in_class = Depth() == 1 && block.clause == EClause::kClass && !block.is_unknown;
    return (Depth() == 0 || is_in_class) && block.indent == CIndent{column, column} && !_fIsMidRow &&
           !_fHasPlaceProblem && !IsContinuation(_fHead.clause) && _fHead.clause != EClause::kCase &&
           before != EClause::kTry && before != EClause::kDecorator;
}

CBlockState CBlockTracker::State() const {
    CBlockState state{_fBlocks, _fHasTooMany, _fHasTooManyFrames};
    for (CBlock& block : state.blocks) {
        block.previous = {};
        block.header = {};
        block.bare_except_start = block.bare_except_end = 0;
        block.takes_all = {};
        block.is_of_try = block.is_first = block.may_follow_anything = false;
        if (!block.lacks_block) block.lacking_clause = EClause::kSimple;
    }
    if (state.IsInClass()) state.blocks.front().previous.clause = EClause::kClass;
    return state;
}

void CBlockTracker::Resume(const CBlockState& state, std::vector<CBlock> closed) {
    _fClosedBefore = std::move(closed);
    _fBlocks = state.blocks;
    _fAreInDoubt =
        std::any_of(_fBlocks.begin(), _fBlocks.end(), [](const CBlock& block) { return block.is_in_doubt; });
    _fIsClassUnknown = state.IsInClass();
    _fHasTooMany = state.has_too_many;
    _fHasTooManyFrames = state.has_too_many_frames;
}

// A header that was moved out of its block is what statements in it were blamed for.
void CBlockTracker::_DropPlacementSince(uint32_t start) {
    _fTakenBackFrom = std::min(_fTakenBackFrom, start);
    std::erase_if(_fProblems, [start](const CProblem& problem) {
        return IsPlacement(problem.code) && problem.start >= start;
    });
}

CProblem& CBlockTracker::_Report(ECode code, uint32_t start, uint32_t end, std::string message) {
    _fProblems.push_back({code, start, end, std::move(message), {}, {}});
    return _fProblems.back();
}

}  // namespace codeloom
