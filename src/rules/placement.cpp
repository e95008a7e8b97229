#include "rules/placement.h"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>
#include <utility>

#include "rules/fields.h"
#include "rules/lazy_imports.h"
#include "syntax/atoms.h"
#include "syntax/expressions.h"
#include "syntax/forms.h"
#include "syntax/imports.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

using EScope = CPlacement::EScope;
using EComprehension = CPlacement::EComprehension;

// Deeper than any text that the interpreter takes.
constexpr int kMaxDepth = 400;

constexpr std::string_view kOutOfExceptStar =
    "'break', 'continue' and 'return' cannot appear in an except* block";

// Words that may be anywhere in an expression.
constexpr uint64_t kWordsWithin = WordBits(EWord::kYield, EWord::kAwait, EWord::kAsync);

// The statement is known without a look below it: `return a + b`, and not `if a: return b`.
bool IsPlainReturn(const CTree& tree) {
    return tree.fRoot.Is(ENodeKind::kReturn) && !tree.Line().MayHaveWords(kWordsWithin);
}

// A feature of `__future__`, with the version that has it first.
struct CFeature {
    std::string_view name;
    int version;
};

constexpr auto kFeatures = std::to_array<CFeature>({{"nested_scopes", 0},
                                                    {"generators", 0},
                                                    {"division", 0},
                                                    {"absolute_import", 0},
                                                    {"with_statement", 0},
                                                    {"print_function", 0},
                                                    {"unicode_literals", 0},
                                                    {"barry_as_FLUFL", 301},
                                                    {"generator_stop", 305},
                                                    {"annotations", 307}});

// A docstring, or a string alone in Python 2: what may come before an import from `__future__`.
bool IsDocstring(const CRawLogical& logical, const CLanguage& language) {
    if (logical.type != ELogicalType::kStringExpression) return false;
    const std::string_view text = logical.Text(logical.tokens.front());
    return !language.IsPython3() || !(HasFields(text) || IsBytesText(text));
}

// What the blocks around a line allow in it.
CPlacement PlacementIn(const std::vector<CBlock>& blocks) {
    CPlacement place;
    for (const CBlock& block : blocks) place.Enter(block.clause);
    return place;
}

bool IsAsyncScope(EScope scope) {
    return scope == EScope::kAsyncFunction;
}

std::string Outside(std::string_view what, const CPlacement& place) {
    std::string message = "'";
    message.append(what).append(place.IsInFunction() ? "' outside async function" : "' outside function");
    return message;
}

}  // namespace

void CPlacement::Enter(EClause clause) {
    switch (clause) {
        case EClause::kDef:
            *this = {.scope = EScope::kFunction};
            break;
        case EClause::kAsyncDef:
            *this = {.scope = EScope::kAsyncFunction};
            break;
        case EClause::kClass:
            *this = {.scope = EScope::kClass};
            break;
        case EClause::kFor:
        case EClause::kAsyncFor:
        case EClause::kWhile:
            in_loop = true;
            left_by_jump = {};
            break;
        case EClause::kExceptStar:
            left_by_return.except_star = left_by_jump.except_star = true;
            break;
        case EClause::kFinally:
            left_by_return.finally = left_by_jump.finally = true;
            break;
        default:
            break;
    }
}

void CPlacementRules::Check(const CRawLogical& logical, const CTree* tree, const CBlockTracker& blocks) {
    if (!MayBreak(logical)) return;
    const bool is_lazy = logical.tokens.front().word == EWord::kLazy;
    const bool is_future = tree != nullptr && !is_lazy && IsFutureImport(*tree, tree->fRoot);
    _fTree = tree;
    _fBlocks = &blocks.Blocks();
    if (is_future) {
        _CheckFuture(tree->fRoot, blocks);
    } else if (tree != nullptr) {
        const bool may_be_docstring =
            !_fBeginning.has_statement || (!_fLanguage.IsPython3() && _fBeginning.has_futures);
        _fBeginning.is_past_futures |= !may_be_docstring || !IsDocstring(logical, _fLanguage);
    }
    _fBeginning.has_statement = true;
    if (tree == nullptr || tree->fIsEmpty || !logical.MayHaveWords(kWordsOfInterest) || blocks.IsInDoubt())
        return;
    if (logical.MayHaveWords(WordBits(EWord::kLazy))) CheckLazyImports(*tree, blocks, _fProblems);
    CPlacement place = _PlaceIn(blocks);
    // A body on the row of its header.
    const EClause header = blocks.Head().clause;
    if (header == EClause::kExceptStar || header == EClause::kFinally) place.Enter(header);
    if (IsPlainReturn(*tree)) return _CheckReturn(tree->fRoot, place);
    _Visit(tree->fRoot, place);
}

void CPlacementRules::CheckEmbedded(const CTree& tree, const CBlockTracker& blocks) {
    if (tree.fIsEmpty || !tree.Line().MayHaveWords(kWordsOfInterest) || blocks.IsInDoubt()) return;
    _fTree = &tree;
    _fBlocks = &blocks.Blocks();
    _Visit(tree.fRoot, _PlaceIn(blocks));
}

const CPlacement& CPlacementRules::_PlaceIn(const CBlockTracker& blocks) {
    if (!_fIsPlaceKnown) _fPlace = PlacementIn(blocks.Blocks());
    _fIsPlaceKnown = true;
    return _fPlace;
}

// Of the blocks around a line, only the innermost may be new.
void CPlacementRules::_TrackFunctions(const std::vector<CBlock>& blocks) {
    const auto is_under_way = [&](const CStrictFunction& function) {
        return function.block_i < blocks.size() &&
               blocks[function.block_i].header.start == function.header_start;
    };
    while (!_fFunctions.empty() && !is_under_way(_fFunctions.back())) {
        _EndFunction(_fFunctions.back());
        _fFunctions.pop_back();
    }
    if (blocks.empty() || !_OpensStrict(blocks.back().clause)) return;
    const size_t block_i = blocks.size() - 1;
    if (_fFunctions.empty() || _fFunctions.back().block_i != block_i)
        _fFunctions.push_back({block_i, blocks[block_i].header.start, {}, {}});
}

// Any generator before 3.3 (PEP 380).
bool CPlacementRules::_IsStrict(EScope scope) const {
    return IsAsyncScope(scope) ||
           (scope == EScope::kFunction && _fLanguage.version < forms::kReturnInGenerator.version);
}

void CPlacementRules::_EndFunction(const CStrictFunction& function) {
    const CSpan& value = function.first_return;
    const CSpan& yield = function.first_yield;
    if (value.start == value.end || yield.start == yield.end) return;
    const bool is_old = _IsStrict(EScope::kFunction);
    _fProblems.push_back(
        {is_old ? ECode::kNewerForm : ECode::kReturnInAsyncGenerator,
         value.start,
         value.end,
         is_old ? MessageOf(forms::kReturnInGenerator) : "'return' with value in async generator",
         {},
         {{yield.start, yield.end, "makes the function a generator"}}});
}

// Imports of features come first in a file, after its docstring.
void CPlacementRules::_CheckFuture(const CTreeNode& statement, const CBlockTracker& blocks) {
    const CTree& tree = *_fTree;
    if (_fBeginning.is_past_futures || blocks.Depth() > 0) {
        const CSpan span = SpanOf(tree, statement);
        _fProblems.push_back({ECode::kFutureNotFirst,
                              span.start,
                              span.end,
                              "from __future__ imports must occur at the beginning of the file",
                              {},
                              {}});
        return;
    }
    _fBeginning.has_futures = true;
    if (const CTreeNode* const star = StarOfFromImport(tree, statement)) return _CheckFeature(*star);
    ForEachImportedName(tree, NamesOfFromImport(tree, statement),
                        [&](const CImportedName& imported) { _CheckFeature(*imported.name); });
}

void CPlacementRules::_CheckFeature(const CTreeNode& name) {
    const std::string_view text = _fTree->Text(name);
    const auto feature = std::find_if(kFeatures.begin(), kFeatures.end(),
                                      [&](const CFeature& candidate) { return candidate.name == text; });
    if (feature != kFeatures.end() && feature->version <= _fLanguage.version) {
        _fBeginning.has_future_annotations |= text == "annotations";
        return;
    }
    const CSpan span = SpanOf(*_fTree, name);
    std::string message = "future feature ";
    message.append(text).append(" is not defined");
    _fProblems.push_back({ECode::kUnknownFeature,
                          span.start,
                          span.end,
                          text == "braces" ? "not a chance" : std::move(message),
                          {},
                          {}});
}

// Nodes

void CPlacementRules::_Visit(const CTreeNode& node, CPlacement place) {
    if (++place.depth > kMaxDepth) return;
    switch (node.kind) {
        case ENodeKind::kFuncdef:
            return _VisitDefinition(node, place, EScope::kFunction);
        case ENodeKind::kClassdef:
            return _VisitDefinition(node, place, EScope::kClass);
        case ENodeKind::kLambda:
            return _VisitLambda(node, place);
        case ENodeKind::kFor:
            return _VisitLoop(node, place);
        case ENodeKind::kCompFor:
            return _VisitComprehension(node, place);
        case ENodeKind::kReturn:
            _CheckReturn(node, place);
            return _VisitAfterKeyword(node, place);
        case ENodeKind::kYield:
            _CheckYield(node, place);
            return _VisitAfterKeyword(node, place);
        case ENodeKind::kFromImport:
            return _CheckImportStar(node, place);
        case ENodeKind::kNonlocal:
            return _CheckNonlocal(node, place);
        case ENodeKind::kAtom:
            return _VisitAtom(node, place);
        case ENodeKind::kUsedArgument:
            return _VisitArgument(node, place);
        case ENodeKind::kKeywordLiteral:
            return _CheckKeyword(node, place);
        case ENodeKind::kNode:
            return _VisitPlainNode(node, place);
        default:
            break;
    }
    _VisitChildren(node, place);
}

void CPlacementRules::_VisitChildren(const CTreeNode& node, const CPlacement& place) {
    for (const CTreeNode& child : _fTree->Children(node)) _Visit(child, place);
}

// The keyword leaf of a statement stands for one that has nothing else.
void CPlacementRules::_VisitAfterKeyword(const CTreeNode& node, const CPlacement& place) {
    for (const CTreeNode& child : _fTree->Children(node).subspan(1)) _Visit(child, place);
}

// A node of a rule without a class of its own, known by the word that it begins with.
void CPlacementRules::_VisitPlainNode(const CTreeNode& node, const CPlacement& place) {
    if (HasWordAt(*_fTree, node, 0, EWord::kAsync)) return _VisitAsync(node, place);
    if (HasWordAt(*_fTree, node, 0, EWord::kWhile)) return _VisitLoop(node, place);
    _VisitChildren(node, place);
}

// `async def`, `async for`, `async with`
//   child    'async'  statement
void CPlacementRules::_VisitAsync(const CTreeNode& node, const CPlacement& place) {
    const CTreeNode& statement = LastChild(*_fTree, node);
    if (statement.Is(ENodeKind::kFuncdef)) return _VisitDefinition(statement, place, EScope::kAsyncFunction);
    if (!IsAsyncScope(place.scope)) {
        const CSpan span = SpanOf(*_fTree, _fTree->Child(node, 0));
        const std::string_view what = statement.Is(ENodeKind::kFor) ? "async for" : "async with";
        std::string message = "'";
        message.append(what).append("' outside async function");
        _ReportMisplaced(ECode::kOutsideAsyncFunction, span, std::move(message));
    }
    _Visit(statement, place);
}

// The last child is the body, on the row of the header or an invented one.
void CPlacementRules::_VisitDefinition(const CTreeNode& node, const CPlacement& place, EScope body_scope) {
    const std::span<const CTreeNode> children = _fTree->Children(node);
    for (const CTreeNode& child : children.first(children.size() - 1)) _Visit(child, place);
    const bool is_strict = _IsStrict(body_scope);
    constexpr size_t kOnItsRow = SIZE_MAX;
    if (is_strict) _fFunctions.push_back({kOnItsRow, 0, {}, {}});
    _Visit(children.back(), {.scope = body_scope, .depth = place.depth});
    if (!is_strict) return;
    _EndFunction(_fFunctions.back());
    _fFunctions.pop_back();
}

// `for` and `while`: the body comes after the first colon, and that of `else` is outside the loop.
void CPlacementRules::_VisitLoop(const CTreeNode& node, const CPlacement& place) {
    CPlacement body = place;
    body.in_loop = true;
    body.left_by_jump = {};
    int colon_count = 0;
    for (const CTreeNode& child : _fTree->Children(node)) {
        colon_count += IsToken(child, kTokenId_COLON);
        _Visit(child, colon_count == 1 ? body : place);
    }
}

void CPlacementRules::_VisitLambda(const CTreeNode& node, const CPlacement& place) {
    if (const CTreeNode* const parameters = ParametersOfLambda(*_fTree, node)) _Visit(*parameters, place);
    _Visit(BodyOfLambda(*_fTree, node), {.scope = EScope::kLambda, .depth = place.depth});
}

void CPlacementRules::_VisitAtom(const CTreeNode& node, CPlacement place) {
    const CTreeNode* const contents = ContentsOfBrackets(*_fTree, node);
    if (contents != nullptr && !contents->IsLeaf() && LastChild(*_fTree, *contents).Is(ENodeKind::kCompFor)) {
        if (BracketOf(*_fTree, node) == EBracket::kParenthesis) {
            _EnterGenerator(place);
        } else {
            _EnterDisplay(node, place);
        }
    }
    _VisitChildren(node, place);
}

void CPlacementRules::_VisitArgument(const CTreeNode& node, CPlacement place) {
    if (IsComprehensionList(*_fTree, node)) _EnterGenerator(place);
    _VisitChildren(node, place);
}

// An asynchronous one makes the comprehensions around it asynchronous, since 3.11, up to a generator
// expression, which may always be.
void CPlacementRules::_EnterDisplay(const CTreeNode& atom, CPlacement& place) const {
    constexpr int kAllowsInComprehension = 311;
    place.outer_comprehension = place.comprehension;
    place.outer_blamed = place.blamed;
    place.in_first_clause = true;
    const bool is_outermost = place.comprehension == EComprehension::kNone;
    const bool is_judged = is_outermost || _fLanguage.version < kAllowsInComprehension;
    place.comprehension = EComprehension::kDisplay;
    if (is_judged) place.blamed = is_outermost && IsAsyncScope(place.scope) ? nullptr : &atom;
}

void CPlacementRules::_EnterGenerator(CPlacement& place) const {
    place.outer_comprehension = place.comprehension;
    place.outer_blamed = place.blamed;
    place.in_first_clause = true;
    place.comprehension = EComprehension::kGenerator;
    place.blamed = nullptr;
}

void CPlacementRules::_VisitComprehension(const CTreeNode& node, const CPlacement& place) {
    const CCompClause clause = CompClauseOf(*_fTree, node);
    if (clause.is_async) _ReportAsyncDisplay(place);
    CPlacement inside = place;
    inside.in_first_clause = false;
    CPlacement iterable = inside;
    if (place.in_first_clause) {
        iterable.comprehension = place.outer_comprehension;
        iterable.blamed = place.outer_blamed;
    }
    _Visit(*clause.target, inside);
    _Visit(*clause.iterable, iterable);
    if (clause.next != nullptr) _Visit(*clause.next, inside);
}

// Rules

void CPlacementRules::_CheckReturn(const CTreeNode& node, const CPlacement& place) {
    const bool leaves_any = place.left_by_return.except_star || place.left_by_return.finally;
    if (place.scope == EScope::kFunction && !leaves_any && !_IsStrict(place.scope)) return;
    const CSpan span = SpanOf(*_fTree, node);
    if (!place.IsInFunction())
        return _ReportMisplaced(ECode::kOutsideFunction, span, "'return' outside function");
    if (_CheckWayOut(place.left_by_return, span, "return")) return;
    const bool has_value = !node.IsLeaf();
    if (has_value && _IsStrict(place.scope) && !_fFunctions.empty() &&
        _fFunctions.back().first_return.end == 0)
        _fFunctions.back().first_return = span;
}

void CPlacementRules::_CheckYield(const CTreeNode& node, const CPlacement& place) {
    const CSpan span = SpanOf(*_fTree, node);
    constexpr int kRefusesInComprehension = 308;
    const bool is_in_own_scope =
        place.comprehension != EComprehension::kNone && _fLanguage.version < kRefusesInComprehension;
    if (is_in_own_scope && _fLanguage.IsPython3()) return;
    if (!place.IsInFunction())
        return _ReportMisplaced(ECode::kOutsideFunction, span, "'yield' outside function");
    if (!_IsStrict(place.scope) || place.comprehension == EComprehension::kGenerator) return;
    if (IsAsyncScope(place.scope) && !node.IsLeaf() && IsYieldFrom(*_fTree, node))
        return _Report(ECode::kYieldFromInAsync, span, "'yield from' inside async function");
    if (!_fFunctions.empty() && _fFunctions.back().first_yield.end == 0)
        _fFunctions.back().first_yield = span;
}

void CPlacementRules::_CheckKeyword(const CTreeNode& leaf, const CPlacement& place) {
    switch (leaf.word) {
        case EWord::kReturn:
            if (leaf.first_child != CTreeNode::kInventedText) _CheckReturn(leaf, place);
            break;
        case EWord::kYield:
            _CheckYield(leaf, place);
            break;
        case EWord::kAwait:
            _CheckAwait(leaf, place);
            break;
        case EWord::kBreak:
        case EWord::kContinue:
            _CheckJump(leaf, place);
            break;
        default:
            break;
    }
}

void CPlacementRules::_CheckAwait(const CTreeNode& leaf, const CPlacement& place) {
    if (place.comprehension != EComprehension::kNone) return _ReportAsyncDisplay(place);
    if (!IsAsyncScope(place.scope))
        _ReportMisplaced(place.IsInFunction() ? ECode::kOutsideAsyncFunction : ECode::kOutsideFunction,
                         SpanOf(*_fTree, leaf), Outside("await", place));
}

void CPlacementRules::_CheckJump(const CTreeNode& leaf, const CPlacement& place) {
    const CSpan span = SpanOf(*_fTree, leaf);
    const bool is_break = leaf.word == EWord::kBreak;
    if (place.in_loop && _CheckWayOut(place.left_by_jump, span, TextOfWord(leaf.word))) return;
    if (!place.in_loop && place.left_by_jump.except_star)
        return _Report(ECode::kJumpOutOfExceptStar, span, std::string(kOutOfExceptStar));
    if (!place.in_loop)
        return _ReportMisplaced(ECode::kOutsideLoop, span,
                                is_break ? "'break' outside loop" : "'continue' not properly in loop");
    constexpr int kAllowsContinueInFinally = 308;
    if (!is_break && place.left_by_jump.finally && _fLanguage.version < kAllowsContinueInFinally)
        _Report(ECode::kContinueInFinally, span, "'continue' not supported inside 'finally' clause");
}

void CPlacementRules::_CheckImportStar(const CTreeNode& node, const CPlacement& place) {
    const CTreeNode* const star = StarOfFromImport(*_fTree, node);
    const bool is_allowed = place.scope == EScope::kModule || !_fLanguage.IsPython3();
    if (star != nullptr && !is_allowed)
        _Report(ECode::kImportStarNotInModule, SpanOf(*_fTree, *star),
                "import * only allowed at module level");
}

void CPlacementRules::_CheckNonlocal(const CTreeNode& node, const CPlacement& place) {
    if (place.scope == EScope::kModule)
        _Report(ECode::kNonlocalInModule, SpanOf(*_fTree, node),
                "nonlocal declaration not allowed at module level");
}

// True for one that is refused. One out of `finally` is only doubtful, since 3.14 (PEP 765).
bool CPlacementRules::_CheckWayOut(const CPlacement::CLeft& left, const CSpan& span, std::string_view word) {
    constexpr int kWarnsOfFinally = 314;
    if (left.except_star) {
        _Report(ECode::kJumpOutOfExceptStar, span, std::string(kOutOfExceptStar));
    } else if (left.finally && _fLanguage.version >= kWarnsOfFinally) {
        std::string message = "'";
        _Report(ECode::kJumpOutOfFinally, span, message.append(word).append("' in a 'finally' block"));
    }
    return left.except_star;
}

void CPlacementRules::_ReportAsyncDisplay(const CPlacement& place) {
    if (place.blamed != nullptr)
        _ReportMisplaced(ECode::kOutsideAsyncFunction, SpanOf(*_fTree, *place.blamed),
                         "asynchronous comprehension outside of an asynchronous function");
}

// What one fault has moved or left out is reported once: in a block, and in a function that lacks its
// `async`.
void CPlacementRules::_ReportMisplaced(ECode code, const CSpan& span, std::string message) {
    if (code == ECode::kOutsideAsyncFunction) {
        const auto scope = std::find_if(_fBlocks->rbegin(), _fBlocks->rend(),
                                        [](const CBlock& block) { return IsScope(block.clause); });
        const bool is_function = scope != _fBlocks->rend() && scope->clause == EClause::kDef;
        if (is_function && std::exchange(_fPlainFunction, scope->header.start) == scope->header.start) return;
    } else if (std::exchange(_fBeginning.misplaced, code) == code) {
        return;
    }
    _Report(code, span, std::move(message));
}

void CPlacementRules::_Report(ECode code, const CSpan& span, std::string message) {
    _fProblems.push_back({code, span.start, span.end, std::move(message), {}, {}});
}

}  // namespace codeloom
