#include "parse/class_table.h"

#include "host/neighbour_call.h"
#include "parse/parser_driver.h"
#include "tree/node_classes.h"

namespace codeloom {

namespace {

nb::handle gOriginalClsForState;  // lives as long as the process

// Node classes are what is in the module's namespace: a class joins the table by being defined there.
nb::list NodeClasses() {
    const nb::handle node_class = nb::type<CNode>();
    nb::list classes;
    for (nb::handle value : HomeModule().attr("__dict__").attr("values")()) {
        if (value.type().is(node_class.type()) && IsSubclass(value, node_class)) classes.append(value);
    }
    return classes;
}

void AddSupportedRules(nb::dict cls_for_state) {
    for (nb::handle cls : NodeClasses())
        for (nb::handle rule : cls.attr("kSupportedRules"))
            cls_for_state[rule.attr("partition")(":")[0].attr("strip")()] = cls;
}

Py_ssize_t HighestSymbol(nb::handle number2symbol) {
    return nb::cast<Py_ssize_t>(nb::module_::import_("builtins").attr("max")(number2symbol));
}

nb::list ClassList(nb::handle grammar, nb::handle cls_for_state) {
    const nb::object number2symbol = grammar.attr("number2symbol");
    const nb::object tok_name = HomeModule().attr("token").attr("tok_name");
    const Py_ssize_t top = HighestSymbol(number2symbol);
    nb::list classes;
    for (Py_ssize_t i = 0; i < top; ++i) {
        nb::object name = number2symbol.attr("get")(i);
        if (name.is_none()) name = tok_name.attr("get")(i);
        const nb::object cls = cls_for_state.attr("get")(name, nb::type<CNode>());
        classes.append(cls.is_none() ? nb::type<CExpression>() : nb::handle(cls));
    }
    classes.append(nb::none());
    return classes;
}

}  // namespace

nb::dict DirectClsForState() {
    nb::dict classes;
    const auto add = [&]<class Class>(const Class*, std::initializer_list<const char*> states) {
        for (const char* state : states) classes[state] = nb::type<Class>();
    };
#define STATES(Class, ...) add(static_cast<const Class*>(nullptr), {__VA_ARGS__})
    STATES(CNameLiteral, "NAME");
    STATES(CStringLiteral, "STRING");
    STATES(CNumberLiteral, "NUMBER");
    STATES(CWithStmt, "with_stmt");
    STATES(CWithItem, "with_item");
    STATES(CPassStmt, "pass_stmt");
    STATES(CExprStmt, "expr_stmt");
    STATES(CReturnStmt, "return_stmt");
    STATES(CPower, "power");
    STATES(CTrailer, "trailer");
    STATES(CAtom, "atom");
    STATES(CFuncdefStmt, "funcdef");
    STATES(CGlobalStmt, "global_stmt");
    STATES(CNonlocalStmt, "nonlocal_stmt");
    STATES(CParametersNode, "parameters");
    STATES(CDefiningArglistNode, "typedargslist", "varargslist");
    STATES(CUsedArglistNode, "arglist");
    STATES(CSingleUsedArgumentNode, "argument");
    STATES(CClassdefStmt, "classdef");
    STATES(CForStmt, "for_stmt");
    STATES(CImportNamesStmt, "import_name");
    STATES(CFromImportStmt, "import_from");
    STATES(CCompForNode, "comp_for", "sync_comp_for", "list_for");
    STATES(CFactorExpr, "factor");
    STATES(CLambdaExpr, "lambdef", "lambdef_nocond");
#undef STATES
    return classes;
}

nb::list BuildClsForStateList(nb::handle grammar, nb::dict cls_for_state) {
    AddSupportedRules(cls_for_state);
    return ClassList(grammar, cls_for_state);
}

void RememberClsForState() {
    nb::dict classes = DirectClsForState();
    AddSupportedRules(classes);
    gOriginalClsForState = classes.release();
}

nb::list OriginalClsForStateList(nb::handle grammar) {
    return ClassList(grammar, gOriginalClsForState);
}

nb::list CPGenParserImpl::_BuildClsForStateList() {
    const nb::object table = nb::type<CPGenParserImpl>().attr("kClsForState");
    if (!nb::isinstance<nb::dict>(table)) RaiseWrongType("dict", table);
    return BuildClsForStateList(_fGrammar, nb::borrow<nb::dict>(table));
}

}  // namespace codeloom
