#include "rules/text_checker.h"

#include <algorithm>

#include "rules/line_rules.h"
#include "rules/literals.h"
#include "rules/parameters.h"
#include "rules/patterns.h"

namespace codeloom {

namespace {

// Quotes may hold anything that reads as a hint.
bool IsHint(const CRawLogical& part) {
    return part.type == ELogicalType::kStringifiedTypeHint || part.type == ELogicalType::kCommentedTypeHint;
}

bool IsInClass(const std::vector<CBlock>& blocks) {
    for (size_t i = blocks.size(); i-- > 0;) {
        const EClause clause = blocks[i].clause;
        if (clause == EClause::kClass) return true;
        if (clause == EClause::kDef || clause == EClause::kAsyncDef) return false;
    }
    return false;
}

// What lies within another problem follows from it.
void DropNested(CProblems& problems, size_t first) {
    if (problems.size() < first + 2) return;
    const auto begin = problems.begin() + static_cast<ptrdiff_t>(first);
    std::stable_sort(begin, problems.end(),
                     [](const CProblem& one, const CProblem& other) { return one.start < other.start; });
    const auto is_nested = [](const CProblem& outer, const CProblem& inner) {
        return inner.start == outer.start || inner.end <= outer.end;
    };
    problems.erase(std::unique(begin, problems.end(), is_nested), problems.end());
}

}  // namespace

void CTextChecker::Enter(const CRawLogical& logical) {
    _fLastToken = {logical.StartOf(logical.tokens.back()), logical.EndOf(logical.tokens.back())};
    if (logical.type == ELogicalType::kComment) return;
    _fBlocks.Enter(logical);
    _fPlacement.Enter(_fBlocks);
    _fLine = &logical;
    _fFirstProblem = _fProblems.size();
}

void CTextChecker::_Check(const CRawLogical& part, const CTree& tree) {
    const CLineSetting setting = _Setting(tree);
    if (!IsHint(part)) CheckLine({tree, _fLanguage, _fProblems, _fNames}, setting);
    if (&part == _fLine) {
        _fAnnotations.clear();
        if (setting.defers_annotations && !part.embedded.empty()) _fAnnotations = AnnotationsWithFields(tree);
        _fPlacement.Check(part, &tree, _fBlocks);
        if (part.MayHaveWords(WordBits(EWord::kYield)) && !tree.HasKind(ENodeKind::kLambda))
            _fBlocks.TakeYield();
    } else {
        _fPlacement.CheckEmbedded(tree, _fBlocks);
        if (!_fAnnotations.empty()) _CheckField(part, tree);
    }
    if (_fProblems.size() != _fFirstProblem) return DropNested(_fProblems, _fFirstProblem);
    if (&part != _fLine || tree.fIsEmpty || !tree.fRoot.Is(ENodeKind::kCase)) return;
    if (const CTreeNode* const name = TakesAllCases(tree, tree.fRoot))
        _fBlocks.TakeAllCases(SpanOf(tree, *name));
}

void CTextChecker::_CheckField(const CRawLogical& part, const CTree& tree) {
    const uint32_t start = part.StartOf(part.tokens.front());
    const auto holds = [&](const CSpan& span) { return span.start <= start && start < span.end; };
    if (std::any_of(_fAnnotations.begin(), _fAnnotations.end(), holds))
        CheckFieldInAnnotation({tree, _fLanguage, _fProblems, _fNames});
}

CLineSetting CTextChecker::_Setting(const CTree& tree) const {
    return {.in_class =
                tree.HasKind(ENodeKind::kCompFor) && !_fBlocks.IsInDoubt() && IsInClass(_fBlocks.Blocks()),
            .defers_annotations = _fPlacement.DefersAnnotations()};
}

// What the trees of a line show doesn't count beside a fault of its grammar.
void CTextChecker::Leave(const CRawLogical& logical, bool has_fault) {
    if (logical.type == ELogicalType::kComment) return;
    if (has_fault) {
        _fProblems.resize(_fFirstProblem);
        _fPlacement.Check(logical, nullptr, _fBlocks);
    } else {
        CheckEnd(logical, _fLanguage, _fProblems);
    }
    _fBlocks.Leave(logical, has_fault);
}

void CTextChecker::Finish() {
    _fBlocks.Finish(_fLastToken);
    _fPlacement.Finish();
}

}  // namespace codeloom
