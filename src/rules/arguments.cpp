#include "rules/arguments.h"

#include "rules/name_set.h"
#include "rules/targets.h"
#include "syntax/atoms.h"
#include "syntax/definitions.h"

namespace codeloom {

namespace {

constexpr int kRefusesGeneratorWithComma = 307;
constexpr int kRefusesKeywordInParentheses = 308;

bool IsUnparenthesizedGenerator(const CTree& tree, const CTreeNode& argument) {
    return argument.Is(ENodeKind::kUsedArgument) && LastChild(tree, argument).Is(ENodeKind::kCompFor);
}

void ReportGenerator(const CRuleContext& context, const CTreeNode& argument) {
    context.Report(ECode::kBareGenerator, argument, "Generator expression must be parenthesized");
}

// What may follow what in a list.
class COrderCheck {
  public:
    explicit COrderCheck(const CRuleContext& context) : _fContext(context) {}

    // False after a fault.
    bool Take(const CTreeNode& argument) {
        const CTree& tree = _fContext.tree;
        const EStars stars = StarsOfArgument(tree, argument);
        if (stars == EStars::kTwo) {
            _fHasTwoStars = true;
        } else if (stars == EStars::kOne) {
            return !_fHasTwoStars ||
                   _Refuse(argument, "iterable argument unpacking follows keyword argument unpacking");
        } else if (IsNamedArgument(tree, argument)) {
            _fHasKeyword = true;
        } else if (_fHasTwoStars) {
            return _Refuse(argument, "positional argument follows keyword argument unpacking");
        } else if (_fHasKeyword) {
            return _Refuse(argument, "positional argument follows keyword argument");
        }
        return true;
    }

  private:
    bool _Refuse(const CTreeNode& argument, std::string_view message) {
        _fContext.Report(ECode::kMisplacedArgument, argument, std::string(message));
        return false;
    }

    const CRuleContext& _fContext;
    bool _fHasKeyword = false;
    bool _fHasTwoStars = false;
};

void CheckOrder(const CRuleContext& context, const CTreeNode& list) {
    COrderCheck order(context);
    for (const CTreeNode& child : context.tree.Children(list))
        if (!IsToken(child, kTokenId_COMMA) && !order.Take(child)) return;
}

void CheckKeyword(const CRuleContext& context, const CTreeNode& keyword) {
    const CTreeNode& name = context.language.version < kRefusesKeywordInParentheses
                                ? DropParentheses(context.tree, keyword)
                                : keyword;
    if (name.Is(ENodeKind::kNameLiteral)) return CheckBoundName(context, name);
    if (IsValueWord(name.word)) {
        context.Report(ECode::kCannotAssign, keyword, Joined("cannot assign to ", context.tree.Text(name)));
    } else {
        context.Report(ECode::kKeywordIsExpression, keyword,
                       "expression cannot contain assignment, perhaps you meant \"==\"?",
                       "use '==' to compare");
    }
}

void CheckGenerators(const CRuleContext& context, const CTreeNode& list) {
    const bool is_alone = list.child_count < 3;
    if (is_alone && context.language.version < kRefusesGeneratorWithComma) return;
    for (const CTreeNode& child : context.tree.Children(list))
        if (IsUnparenthesizedGenerator(context.tree, child)) return ReportGenerator(context, child);
}

}  // namespace

void CheckArguments(const CRuleContext& context, const CTreeNode& list) {
    const CTree& tree = context.tree;
    CNameSet& keywords = context.names;
    keywords.Clear();
    for (const CTreeNode& child : tree.Children(list)) {
        if (!IsNamedArgument(tree, child)) continue;
        const CTreeNode& name = tree.Child(child, 0);
        if (name.Is(ENodeKind::kNameLiteral) && !keywords.Add(tree.Text(name)))
            context.Report(ECode::kRepeatedKeyword, child,
                           Joined("keyword argument repeated: ", tree.Text(name)));
    }
    CheckGenerators(context, list);
    if (context.language.IsPython3()) CheckOrder(context, list);
}

void CheckArgument(const CRuleContext& context, const CTreeNode& argument) {
    if (IsNamedArgument(context.tree, argument)) {
        CheckKeyword(context, context.tree.Child(argument, 0));
    } else if (IsAssigningArgument(context.tree, argument)) {
        CheckWalrus(context, argument);
    }
}

void CheckBases(const CRuleContext& context, const CTreeNode& classdef) {
    const CTreeNode* const bases = BasesOfClassdef(context.tree, classdef);
    if (bases != nullptr && IsUnparenthesizedGenerator(context.tree, *bases) &&
        context.language.version >= kRefusesGeneratorWithComma)
        ReportGenerator(context, *bases);
}

}  // namespace codeloom
