#include "tree/node_classes.h"

#include <initializer_list>

#include "tree/node_factory.h"
#include "tree/node_helpers.h"
#include "tree/node_to_text.h"
#include "tree/recycling.h"

namespace codeloom {

namespace {

nb::list Texts(std::initializer_list<const char*> texts) {
    nb::list result;
    for (const char* text : texts) result.append(nb::str(text));
    return result;
}

// One row of the list: a class, its base, what it stands for, and the grammar rules that it supports. Of a
// rule the text before the colon counts; the rest documents the child layout that the class relies on.
template <class Class, class Base>
void Bind(nb::module_& module, const char* name, const char* doc,
          std::initializer_list<const char*> rules = {}) {
    kNodeKind<Class>.DeriveFrom(kNodeKind<Base>);
    nb::class_<Class, Base, THostSubclass<Class>> binding(module, name, doc);
    binding.def(TInit<CRef<CNodeClassInfo>>(), "cls_info"_a.none() = nb::none());
    BindOperations(binding);
    if (rules.size() != 0) binding.attr("kSupportedRules") = Texts(rules);
}

void BindClassInfo(nb::module_& module) {
    nb::class_<CNodeClassInfo>(
        module, "CNodeClassInfo", Collected<CNodeClassInfo>(),
        "One grammar state or token type of a factory: its class, number, name and free list.")
        .def(TInit<nb::object, int, nb::object>(), "cls"_a.none(), "nodetype"_a, "name"_a.none())
        .def_ro("fCls", &CNodeClassInfo::fCls, "The node class to make for this state.")
        .def_ro("fNodeType", &CNodeClassInfo::fNodeType, "Grammar state number or token type.")
        .def_ro("fName", &CNodeClassInfo::fName,
                "Name of the state, such as \"funcdef\" or \"NAME\"; may be None.")
        .def_ro("fFirstFree", &CNodeClassInfo::fFirstFree, "First node of the free list, or None.");
}

void BindNode(nb::module_& module) {
    kNodeKind<CNode>.DeriveFrom(CNodeKind());
    nb::class_<CNode, THostSubclass<CNode>> binding(module, "CNode", Collected<CNode>(),
                                                    "Base of all syntax tree nodes.");
    binding.def(TInit<CRef<CNodeClassInfo>>(), "cls_info"_a.none() = nb::none())
        .def_prop_ro(
            "fChildren", [](CNode& node) { return node.fChildren.AsHost(); },
            "List of child nodes in source order; None for a leaf.")
        .def_ro("fText", &CNode::fText, "Token text; None for a non-terminal.")
        .def_ro("fContext", &CNode::fContext, "Token index of the node's (first) token.")
        .def_ro("fClsInfo", &CNode::fClsInfo, "The record that made the node.")
        .def_ro("fNextFree", &CNode::fNextFree, "Link of the free list; stale while the node is in use.")
        .def("__repr__", [](CNode& node) {
            return nb::str("{}: {}").format(nb::repr(node.Self().type()), node.GetStateName());
        });
    BindOperations(binding);
    binding.attr("kSupportedRules") = nb::list();
}

void BindFactory(nb::module_& module) {
    nb::class_<CNodeFactory, THostSubclass<CNodeFactory>> binding(
        module, "CNodeFactory", Collected<CNodeFactory>(),
        "Makes nodes for one grammar, from the free lists of its class records.");
    binding
        .def(TInit<nb::object, nb::object, nb::object, nb::object, nb::object>(), "gram"_a,
             "cls_for_nodetype"_a, "keywords"_a.none(), "tok_number2name"_a, "op_text2number"_a)
        .def_ro("_fOperatorStrToNumber", &CNodeFactory::_fOperatorStrToNumber, "Operator text to token type.")
        .def_prop_ro("_fClassInfoList", &CNodeFactory::GetClassInfoList,
                     "The class records by node type, as a new list.");
    BindOperations(binding);
}

void BindExpressions(nb::module_& module) {
    Bind<CExpression, CNode>(module, "CExpression", "Base class for all expressions.");
    Bind<CIfElseExpression, CExpression>(module, "CIfElseExpression", "E if condition else E.",
                                         {"test: or_test ['if' or_test 'else' test] | lambdef"});
    Bind<COperatorExpression, CExpression>(
        module, "COperatorExpression", "op T, T op T, T op T op T expressions.",
        {"or_test: and_test ('or' and_test)*", "and_test: not_test ('and' not_test)*",
         "not_test: 'not' not_test | comparison", "comparison: expr (comp_op expr)*",
         "expr: xor_expr ('|' xor_expr)*", "xor_expr: and_expr ('^' and_expr)*",
         "and_expr: shift_expr ('&' shift_expr)*", "shift_expr: arith_expr (('<<'|'>>') arith_expr)*",
         "arith_expr: term (('+'|'-') term)*", "term: factor (('*'|'/'|'%'|'//') factor)*"});
    Bind<CStarExpression, CExpression>(module, "CStarExpression", "*n used as an expression.",
                                       {"star_expr: '*' expr"});
    Bind<CDottedName, CExpression>(module, "CDottedName", "a.b.c in decorators and imports.",
                                   {"dotted_name: NAME ('.' NAME)*"});
    Bind<CLambdaExpr, CExpression>(module, "CLambdaExpr", "Lambda.");
    Bind<CTestExpr, CExpression>(module, "CTestExpr", "Declared, with no rule and no state.");
    Bind<CYieldExpr, CExpression>(module, "CYieldExpr", "Yield.",
                                  {"yield_expr: 'yield' [testlist]", "yield_expr: 'yield' [yield_arg]"});
    Bind<CTestListStarExpr, CExpression>(
        module, "CTestListStarExpr", "Comma lists of expressions.",
        {"exprlist: expr (',' expr)* [',']", "testlist: test (',' test)* [',']",
         "testlist_star_expr: (test|star_expr) (',' (test|star_expr))* [',']",
         "testlist_comp: test ( comp_for | (',' test)* [','] )",
         "testlist_comp: (namedexpr_test|star_expr) ( comp_for | (',' (namedexpr_test|star_expr))* [','] )"});
    Bind<CAtomExpr, CExpression>(module, "CAtomExpr", "[await] atom trailer*.",
                                 {"atom_expr: [AWAIT] atom trailer*"});
    Bind<CPower, CExpression>(module, "CPower", "Atom, trailers and exponent.",
                              {"power: atom trailer* ['**' factor]", "power: atom_expr ['**' factor]"});
    Bind<CFactorExpr, CExpression>(module, "CFactorExpr", "Unary +, -, ~.");
    Bind<CNamedExpr, CExpression>(module, "CNamedExpr", ":= expression.",
                                  {"namedexpr_test: test [':=' test]"});
    Bind<CBinaryOp, CNode>(module, "CBinaryOp", "Declared, with no rule and no state.");
    Bind<CYieldArg, CNode>(module, "CYieldArg", "Argument of yield.", {"yield_arg: 'from' test | testlist"});
    Bind<CCompForNode, CNode>(
        module, "CCompForNode",
        "A 'for' clause in a generator expression, and list comprehension in the 2.7 grammar.");
    Bind<CListmakerNode, CNode>(module, "CListmakerNode", "Contents of a list display in the 2.7 grammar.",
                                {"listmaker: test ( list_for | (',' test)* [','] )"});
    Bind<CTrailer, CNode>(module, "CTrailer", "(), [] or .name after an atom.");
}

void BindAtoms(nb::module_& module) {
    Bind<CAtom, CExpression>(module, "CAtom", "Bracketed atoms and adjacent strings.");
    Bind<CNameLiteral, CExpression>(module, "CNameLiteral", "A name token.");
    Bind<CKeywordLiteral, CExpression>(module, "CKeywordLiteral", "A keyword token.");
    Bind<CNumberLiteral, CExpression>(module, "CNumberLiteral", "A number token.");
    Bind<CStringLiteral, CExpression>(module, "CStringLiteral", "A string token.");
}

void BindStatements(nb::module_& module) {
    Bind<CStmt, CNode>(module, "CStmt", "Base class for all statements.");
    Bind<CClassdefStmt, CStmt>(module, "CClassdefStmt", "Class statement.");
    Bind<CFuncdefStmt, CStmt>(module, "CFuncdefStmt", "def statement.");
    Bind<CIfStmt, CStmt>(module, "CIfStmt", "If statement.",
                         {"if_stmt: 'if' test ':' suite ('elif' test ':' suite)* ['else' ':' suite]"});
    Bind<CMatchStmt, CStmt>(module, "CMatchStmt", "Match statement.");
    Bind<CCaseStmt, CStmt>(module, "CCaseStmt", "Case statement.");
    Bind<CDelStmt, CStmt>(module, "CDelStmt", "Del statement.", {"del_stmt: 'del' exprlist"});
    Bind<CGlobalStmt, CStmt>(module, "CGlobalStmt", "Global statement.");
    Bind<CNonlocalStmt, CStmt>(module, "CNonlocalStmt", "Nonlocal statement.");
    Bind<CForStmt, CStmt>(module, "CForStmt", "For statement.");
    Bind<CWithItem, CNode>(module, "CWithItem", "One item of a with statement.");
    Bind<CWithStmt, CStmt>(module, "CWithStmt", "With statement.");
    Bind<CPassStmt, CStmt>(module, "CPassStmt", "Pass statement.");
    Bind<CAnnotatedAssignNode, CNode>(module, "CAnnotatedAssignNode", "Tail of an annotated assignment.",
                                      {"annassign: ':' test ['=' test]"});
    Bind<CExprStmt, CStmt>(module, "CExprStmt", "Expression, assignment and annotated assignment.");
    Bind<CReturnStmt, CStmt>(module, "CReturnStmt", "Return statement.");
    Bind<CWithTypeParameters, CStmt>(module, "CWithTypeParameters",
                                     " Pseudo node for type parameterized statements (see PEP 695).\n    \n  "
                                     "  fChildren is list of CTypeParameter "
                                     "nodes followed by the statement\n    being parameterized (assignment, "
                                     "classdef, or funcdef as of Sept 2023) ");
    Bind<CSingleDecorator, CNode>(module, "CSingleDecorator", "One decorator.",
                                  {"decorator: '@' dotted_name [ '(' [arglist] ')' ] NEWLINE"});
    Bind<CMultipleDecorators, CNode>(module, "CMultipleDecorators", "A decorator list.",
                                     {"decorators: decorator+"});
    Bind<CExceptClause, CNode>(
        module, "CExceptClause", "Except clause.",
        {"except_clause: 'except' [test [('as' | ',') test]]", "except_clause: 'except' [test ['as' NAME]]"});
    Bind<CTypeParameter, CNode>(module, "CTypeParameter",
                                " Pseudo node used with CWithTypeParameters class -- stores one\n    type "
                                "parameter that is defined. Prefix is "
                                "None, '*', or '**'.\n    \n    fChildren is [prefix] name [: expr]\n    ");
}

void BindPatterns(nb::module_& module) {
    Bind<CPatternNode, CNode>(module, "CPatternNode", "Base class for the patterns of a case.");
    Bind<CSequencePatternNode, CPatternNode>(module, "CSequencePatternNode", "[a, b] as a pattern.");
    Bind<CMappingPatternNode, CPatternNode>(module, "CMappingPatternNode", "{'key': a} as a pattern.");
    Bind<CClassArgumentPatternNode, CPatternNode>(module, "CClassArgumentPatternNode",
                                                  "name=a in a class pattern.");
    Bind<CClassPatternNode, CPatternNode>(module, "CClassPatternNode", "Name(a, name=b) as a pattern.");
}

void BindImportsAndArguments(nb::module_& module) {
    Bind<CImportNamesStmt, CNode>(module, "CImportNamesStmt", "import a, b.");
    Bind<CFromImportStmt, CNode>(module, "CFromImportStmt", "from a import b.");
    Bind<CSingleUsedArgumentNode, CNode>(module, "CSingleUsedArgumentNode", "One argument of a call.");
    Bind<CFunctionParameterDef, CNode>(module, "CFunctionParameterDef",
                                       "One parameter definition with a possible annotation.",
                                       {"fpdef: NAME | '(' fplist ')'", "tfpdef: NAME [':' test]"});
    Bind<CDefiningArglistNode, CNode>(module, "CDefiningArglistNode", "Parameter list of a definition.",
                                      {"fplist: fpdef (',' fpdef)* [',']"});
    Bind<CUsedArglistNode, CNode>(module, "CUsedArglistNode", "Argument list of a call.");
    Bind<CParametersNode, CNode>(module, "CParametersNode", "( typedargslist ).");
}

}  // namespace

void BindNodeClasses(nb::module_& module) {
    BindClassInfo(module);
    BindNode(module);
    BindExpressions(module);
    BindAtoms(module);
    BindArgumentInfo(module);
    BindAsNames(module);
    BindImportsAndArguments(module);
    BindStatements(module);
    BindPatterns(module);
    BindFactory(module);
    BindNodeHelpers(module);
    BindNodeToText(module);
    module.def("FinishedWithNode", &FinishedWithNode, "node"_a.none(),
               "Give the tree under `node` back to the free lists. Nobody may hold a node of it afterwards.");
    module.def(
        "NotCompiledFinishedWithNode", [](CNode& node) { FinishedWithNode(node.Self()); }, "node"_a,
        "The same as FinishedWithNode, for hosts.");
}

}  // namespace codeloom
