#include "syntax/syntax_grammar.h"

#include <cassert>
#include <string>

#include "text/token_type.h"

namespace codeloom {

namespace {

struct CRuleKind {
    std::string_view rule;
    ENodeKind kind;
};

// Rules that aren't in the list have nodes of the kind kNode.
constexpr auto kRuleKinds = std::to_array<CRuleKind>({
    {"and_expr", ENodeKind::kOperators},
    {"and_test", ENodeKind::kOperators},
    {"annassign", ENodeKind::kAnnotatedAssign},
    {"arglist", ENodeKind::kUsedArglist},
    {"argument", ENodeKind::kUsedArgument},
    {"arith_expr", ENodeKind::kOperators},
    {"atom", ENodeKind::kAtom},
    {"atom_expr", ENodeKind::kAtomExpr},
    {"classdef", ENodeKind::kClassdef},
    {"comp_for", ENodeKind::kCompFor},
    {"comparison", ENodeKind::kOperators},
    {"decorator", ENodeKind::kSingleDecorator},
    {"decorators", ENodeKind::kMultipleDecorators},
    {"del_stmt", ENodeKind::kDel},
    {"dotted_name", ENodeKind::kDottedName},
    {"except_clause", ENodeKind::kExceptClause},
    {"expr", ENodeKind::kOperators},
    {"expr_stmt", ENodeKind::kExprStmt},
    {"exprlist", ENodeKind::kTestList},
    {"factor", ENodeKind::kFactor},
    {"for_stmt", ENodeKind::kFor},
    {"fpdef", ENodeKind::kParameterDef},
    {"fplist", ENodeKind::kDefiningArglist},
    {"funcdef", ENodeKind::kFuncdef},
    {"global_stmt", ENodeKind::kGlobal},
    {"if_stmt", ENodeKind::kIf},
    {"import_from", ENodeKind::kFromImport},
    {"import_name", ENodeKind::kImportNames},
    {"lambdef", ENodeKind::kLambda},
    {"lambdef_nocond", ENodeKind::kLambda},
    {"list_for", ENodeKind::kCompFor},
    {"listmaker", ENodeKind::kListmaker},
    {"namedexpr_test", ENodeKind::kNamedExpr},
    {"nonlocal_stmt", ENodeKind::kNonlocal},
    {"not_test", ENodeKind::kOperators},
    {"or_test", ENodeKind::kOperators},
    {"parameters", ENodeKind::kParameters},
    {"pass_stmt", ENodeKind::kPass},
    {"power", ENodeKind::kPower},
    {"return_stmt", ENodeKind::kReturn},
    {"shift_expr", ENodeKind::kOperators},
    {"star_expr", ENodeKind::kStar},
    {"star_test", ENodeKind::kStar},
    {"sync_comp_for", ENodeKind::kCompFor},
    {"term", ENodeKind::kOperators},
    {"test", ENodeKind::kIfElse},
    {"testlist", ENodeKind::kTestList},
    {"testlist_comp", ENodeKind::kTestList},
    {"testlist_star_expr", ENodeKind::kTestList},
    {"tfpdef", ENodeKind::kParameterDef},
    {"trailer", ENodeKind::kTrailer},
    {"typedargslist", ENodeKind::kDefiningArglist},
    {"varargslist", ENodeKind::kDefiningArglist},
    {"with_item", ENodeKind::kWithItem},
    {"with_stmt", ENodeKind::kWith},
    {"xor_expr", ENodeKind::kOperators},
    {"yield_arg", ENodeKind::kYieldArg},
    {"yield_expr", ENodeKind::kYield},
});

constexpr auto kOperatorTexts = std::to_array<std::string_view>(
    {"(",  ")",  "[",  "]",  ":",  ",",  ";",  "+",  "-",  "*",  "/",   "|",   "&",   "<",   ">",  "=",  ".",
     "%",  "`",  "{",  "}",  "@",  "@=", "==", "!=", "<>", "<=", ">=",  "~",   "^",   "<<",  ">>", "**", "+=",
     "-=", "*=", "/=", "%=", "&=", "|=", "^=", "//", "->", ":=", "...", "<<=", ">>=", "**=", "//="});

CTokenTypes LanguageTokenTypes() {
    CTokenTypes types;
    for (const CTokenTypeName& type : kTokenTypeNames)
        types.type_of_name.emplace(std::string(type.name), type.number);
    for (const std::string_view text : kOperatorTexts)
        types.type_of_operator.emplace(std::string(text), GetTokenType(text));
    return types;
}

ENodeKind KindOf(std::string_view rule) {
    for (const CRuleKind& entry : kRuleKinds)
        if (entry.rule == rule) return entry.kind;
    return ENodeKind::kNode;
}

}  // namespace

CSyntaxGrammar::CSyntaxGrammar(std::string_view name, std::string_view text)
    : _fText(text),
      _fRules(ReadGrammarText(std::string(name), text), LanguageTokenTypes()),
      _fTables(_fRules, true) {
    for (const CGrammarRules::CRule& rule : _fRules.Rules()) {
        _fKindOfRule.push_back(KindOf(rule.name));
        _fFormOfRule.push_back(RuleFormOf(rule.name));
    }
    _FindLabels();
}

void CSyntaxGrammar::_FindLabels() {
    _fLabelOfType.fill(_fTables.UnknownLabel());
    _fLabelOfWord.fill(kNoLabel);
    for (size_t i = 0; i < _fRules.Terminals().size(); ++i) {
        const CTerminal& terminal = _fRules.Terminals()[i];
        const int label = _fTables.LabelOfTerminal(static_cast<int>(i));
        if (terminal.text.empty()) {
            _fLabelOfType[static_cast<size_t>(terminal.type)] = label;
        } else {
            const EWord word = WordOf(terminal.text);
            assert(word != EWord::kNone);
            _fLabelOfWord[static_cast<size_t>(word)] = label;
        }
    }
}

int CSyntaxGrammar::NumberOfRule(std::string_view name) const {
    for (size_t i = 0; i < _fRules.Rules().size(); ++i)
        if (_fRules.Rules()[i].name == name) return CGrammarRules::kFirstRuleNumber + static_cast<int>(i);
    return -1;
}

}  // namespace codeloom
