// Statements that define names without an assignment. Of a `def` or a `class` only the header is read.
#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "strutils/text.h"
#include "symbolinfo/module_constants.h"
#include "walker/node_walker.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kIsScopeStartLogical("logicalline", "IsScopeStartLogical");

// What an import binds: the name after `as`, or the module's own.
nb::object BoundName(const CAsName& as_name) {
    return AsUtf8(as_name.as_name.is_none() ? as_name.module_name : as_name.as_name);
}

CRef<CAsName> ItemAt(const CAsNameList& as_names, Py_ssize_t i) {
    return CRef<CAsName>(Instance<CAsName>(ListItem(as_names, i)));
}

}  // namespace

// Imports

void CNodeWalker::_VisitImportNames(CImportNamesStmt& node) {
    const CAsNameList as_names = node.GetAsNameList();
    for (Py_ssize_t i = 0; i < ListSize(as_names); ++i) {
        const CRef<CAsName> as_name = ItemAt(as_names, i);
        nb::object name = BoundName(*as_name);
        nb::object module = AsUtf8(as_name->module_name);
        const CUtf8 bound(name);
        if (const size_t dot = bound->find('.'); dot != std::string_view::npos)
            name = module = JoinUtf8({bound->substr(0, dot)});
        _DefineImported(*as_name, name, Utf8Concat2(gPrefixes.kImportPrefix, module));
    }
}

void CNodeWalker::_VisitFromImport(CFromImportStmt& node) {
    const nb::object module = AsUtf8(node.GetFromString());
    const auto equiv_for = [&](nb::handle imported) {
        return Utf8Concat4(gPrefixes.kFromImportPrefix, module, nb::bytes(" "), imported);
    };
    if (node.GetImportStar()) {
        static const CHostText kStar("*");
        return _AddTypeEquiv(nb::handle(kStar), equiv_for(kStar));
    }
    const CAsNameList as_names = node.GetAsNameList();
    for (Py_ssize_t i = 0; i < ListSize(as_names); ++i) {
        const CRef<CAsName> as_name = ItemAt(as_names, i);
        _DefineImported(*as_name, BoundName(*as_name), equiv_for(as_name->module_name));
    }
}

void CNodeWalker::_DefineImported(const CAsName& as_name, nb::object name, nb::object equiv) {
    _AddNameDefined(name);
    _AddTypeEquiv(name, equiv);
    if (as_name.as_name.is_none()) return;
    _AddTypeEquiv(name, Utf8Concat2(gPrefixes.kImportAsNamePrefix, as_name.as_name));
}

// Functions

void CNodeWalker::_VisitFuncdef(CFuncdefStmt& node) {
    const CTextOrNone name = node.GetFunctionName();
    if (!name.is_none()) _AddNameDefined(name);
    const CRef<CParametersNode> parameters = node.GetParameters();
    if (!parameters) return;
    _VisitParameters(*parameters);
    if (const CExpressionRef result = node.GetReturnType()) _VisitNode(*result);
}

void CNodeWalker::_VisitParameters(CParametersNode& node) {
    _ProcessDefiningArgList(GetDefiningArgInfoList(CNodeRef(&node)));
}

void CNodeWalker::_ProcessDefiningArgList(const CArgumentList& arg_list) {
    const CRecursionScope recursion;
    for (const CArgument& argument : arg_list) {
        if (argument.is_tuple) {
            _ProcessDefiningArgList(argument.tuple);
        } else {
            HostAssert(!argument.is_foreign);
            if (argument.name) _ProcessDefiningArg(argument);
        }
    }
}

void CNodeWalker::_ProcessDefiningArg(const CArgument& argument) {
    HostAssert(!argument.name->fText.is_none());
    const CTextOrUtf8 name = argument.name->fText;
    _AddArgNameDefined(name);
    const CBytesOrNone equiv = _EquivForArgument(argument);
    if (!equiv.is_none()) _AddArgInfoBytes(name, equiv);
    if (argument.value) _VisitNode(*argument.value);
    if (argument.type_expr) _VisitNode(*argument.type_expr);
}

CBytesOrNone CNodeWalker::_EquivForArgument(const CArgument& argument) {
    if (argument.value) return _TypeEquivForNode(*argument.value);
    if (TextIs(argument.prefix, "*")) return nb::borrow(gInstanceNames.kTupleInstanceName);
    if (TextIs(argument.prefix, "**")) return nb::borrow(gInstanceNames.kDictInstanceName);
    return CBytesOrNone();
}

void CNodeWalker::_VisitLambdaExpr(CLambdaExpr& node) {
    if (const CNodeRef arguments = node.GetArgumentsNode())
        _ProcessLambdaDefiningArgList(GetDefiningArgInfoList(arguments));
    _VisitNode(*node.GetBodyExpr());
}

void CNodeWalker::_ProcessLambdaDefiningArgList(const CArgumentList& arg_list) {
    const CRecursionScope recursion;
    for (const CArgument& argument : arg_list) {
        if (argument.is_tuple) {
            _ProcessLambdaDefiningArgList(argument.tuple);
            continue;
        }
        HostAssert(!argument.is_foreign);
        if (argument.name) _VisitStoreContextNode(*argument.name, true);
        if (argument.value) _VisitNode(*argument.value);
    }
}

// Classes and scopes

void CNodeWalker::_VisitClassdef(CClassdefStmt& classdef_node) {
    const CTextOrNone name = classdef_node.GetClassName();
    if (!name.is_none()) _AddNameDefined(name);
    for (const CArgument& base : classdef_node.GetBaseClassList()) _VisitNode(*base.value);
}

void CNodeWalker::_VisitGlobalStmt(CGlobalStmt& node) {
    _AddToEach(node.GetUtf8NameList(), gPrefixes.kGlobalPrefix);
}

void CNodeWalker::_VisitNonlocalStmt(CNonlocalStmt& node) {
    _AddToEach(node.GetUtf8NameList(), gPrefixes.kNonlocalPrefix);
}

void CNodeWalker::_AddToEach(const CNameList& names, nb::handle equiv) {
    for (Py_ssize_t i = 0; i < ListSize(names); ++i) _AddTypeEquiv(ListItem(names, i), equiv);
}

// A bound follows the stars: "*" of `*Ts`, "int" of `T: int`. On a line that opens no scope, such as
// `type X[T] = int`, the parameter leaves no record.
void CNodeWalker::_VisitTypeParameter(CTypeParameter& type_param) {
    const CTextOrNone name = type_param.GetName();
    if (name.is_none()) return;
    const CTextOrNone prefix = type_param.GetPrefix();
    nb::object equiv = nb::borrow(gPrefixes.kTypeParameterPrefix);
    if (!prefix.is_none()) equiv = Utf8Concat2(equiv, prefix);
    if (const CNodeRef spec = type_param.GetSpecNode()) {
        _VisitNode(*spec);
        const nb::bytes blank(prefix.is_none() ? "" : " ");
        const CBytesOrNone text = _TextForNode(*spec);
        if (!text.is_none()) equiv = Utf8Concat3(equiv, blank, text);
    }
    if (IsTrue(kIsScopeStartLogical(_fLogical))) _AddArgInfoBytes(name, equiv);
}

}  // namespace codeloom
