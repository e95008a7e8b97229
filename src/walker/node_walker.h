// walker/: what one logical line does with names.
//   in     the typed tree of one line, and its CLogicalLine
//   out    records appended to that line, in the order in which the walk meets what they tell; the names read
//          come at the end
//   keeps  nothing from one line to the next, but its limits and its text converter
//   start  at CNodeWalker::Walk, then the table in dispatch.cpp
//
// loads.cpp          names, chains, calls, comprehensions, decorators
// definitions.cpp    `def`, `lambda`, `class`, imports, `global`, type parameters
// targets.cpp        assignments: the names on the left with what stands on the right
// statements.cpp     `for`, `with`, `except`, `return`, `yield`, `:=`, `match`, `case`
// type_equivs.cpp    what a value is recorded as
#pragma once

#include <optional>

#include <nanobind/nanobind.h>
#include <nanobind/stl/optional.h>

#include "neighbours/logicalline/logical_line.h"
#include "tree/argument_info.h"
#include "tree/node_classes.h"
#include "tree/node_to_text.h"
#include "walker/chain_text.h"
#include "walker/names_found.h"
#include "walker/walk_limits.h"

namespace codeloom {

class CNodeWalker : public CHosted {
  public:
    void Init(nb::tuple version_triple);

    virtual void Walk(CNodeRef node, CLogicalLine& logical);
    virtual void _ProcessNamesFound(CNode& node);
    virtual void _VisitChildren(CNode& node);
    virtual void _RaiseIfNotInstance(nb::handle node, nb::handle cls);
    virtual void _VisitNode(CNode& node);
    virtual void _VisitStoreContextNode(CNode& node, bool within_sub_expr = false);
    virtual void _VisitLoadContextNode(CNode& node);
    virtual void _VisitCompForNode(CCompForNode& node);
    virtual void _VisitNameLiteral(CNameLiteral& node, CNodeRef atom_node = nullptr,
                                   std::optional<CNodeRange> all_trailers = std::nullopt, int trailer_i = -1);
    virtual void _VisitDottedName(CDottedName& node);
    virtual void _ProcessLoadName(CTextOrNone name);
    virtual void _VisitImportNames(CImportNamesStmt& node);
    virtual void _VisitFromImport(CFromImportStmt& node);
    virtual void _VisitExprStmt(CExprStmt& node);
    virtual void _VisitWithItem(CWithItem& node);
    virtual void _VisitFuncdef(CFuncdefStmt& node);
    virtual void _VisitLambdaExpr(CLambdaExpr& node);
    virtual void _ProcessLambdaDefiningArgList(const CArgumentList& arg_list);
    virtual void _VisitGlobalStmt(CGlobalStmt& node);
    virtual void _VisitNonlocalStmt(CNonlocalStmt& node);
    virtual void _VisitParameters(CParametersNode& node);
    virtual void _ProcessDefiningArgList(const CArgumentList& arg_list);
    virtual void _VisitAssignment(CExprStmt& node);
    virtual void _VisitForStmt(CForStmt& node);
    virtual void _ProcessTargets(CNode& lhs, CNodeRef rhs, CBytesOrNone extra_trailer = CBytesOrNone());
    virtual void _VisitAugAssign(CExprStmt& node);
    virtual void _VisitAnnotatedAssign(CExprStmt& node);
    virtual void _VisitReturn(CReturnStmt& return_stmt);
    virtual void _VisitYield(CYieldExpr& yield_expr);
    virtual void _VisitPower(CPower& node);
    virtual void _VisitAtomExpr(CAtomExpr& node);
    virtual void _VisitAtomPlusTrailers(CNode& atom_node, const CNodeRange& all_trailers);
    virtual void _VisitCall(CNode& atom, const CNodeRange& prev_trailers, CNode& arglist);
    virtual void _ProcessFunctionCall(CBytesOrNone func_name, const CArgumentList& arg_list);
    virtual void _VisitSingleDecorator(CSingleDecorator& node);
    virtual void _ProcessIsInstanceCall(const CArgumentList& arg_list);
    virtual void _VisitClassdef(CClassdefStmt& classdef_node);
    virtual void _VisitExceptClause(CExceptClause& exc_clause);
    virtual void _AppendEquivNode(CNode& name_node, CNodeRef equiv_node,
                                  CBytesOrNone extra_trailer = CBytesOrNone());
    virtual void _AppendSubscriptedEquivNode(CNode& name_node, CNodeRef equiv_node,
                                             Py_ssize_t subscript = -1);
    virtual void _AddNodeInfoStr(CNode& name_node, CTextOrUtf8OrNone istr);
    virtual CBytesOrNone _TypeEquivForNode(CNode& node, CBytesOrNone extra_trailer = CBytesOrNone());
    virtual CBytesOrNone _TypeEquivForOperatorExpression(COperatorExpression& op_expr);
    virtual void _VisitNamedExpr(CNode& node);
    virtual void _VisitCaseStmt(CCaseStmt& case_stmt);
    virtual void _VisitMatchStmt(CMatchStmt& match_stmt);
    virtual void _VisitPatternNode(CPatternNode& pattern_node);
    virtual void _VisitTypeParameter(CTypeParameter& type_param);
    virtual void _AddNameDefined(CTextOrUtf8 name);
    virtual void _AddArgNameDefined(CTextOrUtf8 name);
    virtual void _AddTypeEquiv(CTextOrUtf8 name, CTextOrUtf8 equiv);
    virtual void _AddArgInfoBytes(CTextOrUtf8 name, CTextOrUtf8 ibytes);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fLogical);
        visit(_fToText);
    }

    bool _fIncludeExprText = true;             // literals of numbers and strings are recorded with their text
    bool _fIncludeOperatorExpressions = true;  // for _TypeEquivForOperatorExpression
    Py_ssize_t _fMaxOperatorExpressionLength = 120;
    bool _fPy3 = true;  // the analysed language is 3.0 or later
    CRef<CNodeToTextConverterImpl> _fToText;

  private:
    // What the converter gives for a node or a chain, as bytes.
    CBytesOrNone _TextForNode(CNode& node, const CNodeTextOptions& options = {});
    CBytesOrNone _TextForChain(const CChainParts& chain);

    // The same for what is a name or a chain of names throughout; none for anything else.
    CBytesOrNone _DottedNameOf(CNode& node);

    // The texts that stand for an instance of a class, or of each class of a tuple, as far as they have
    // names.
    std::vector<nb::object> _InstanceNamesFor(CNode& class_or_tuple);

    CTextOrNone _NameInChain(CNode& atom, const CNodeRange& trailers, Py_ssize_t count);
    void _VisitTrailer(CNode& atom_node, const CNodeRange& all_trailers, Py_ssize_t i);
    void _RaiseIfBareGenerator(const CArgument& argument);
    CBytesOrNone _TextForArguments(const CArgumentList& arg_list);
    void _AddToEach(const CNameList& names, nb::handle equiv);
    void _DefineImported(const CAsName& as_name, nb::object name, nb::object equiv);
    void _ProcessDefiningArg(const CArgument& argument);
    CBytesOrNone _EquivForArgument(const CArgument& argument);
    void _ProcessStarredTarget(CStarExpression& target);

    CBytesOrNone _EquivForAtom(CAtom& atom, const CBytesOrNone& extra_trailer);
    CBytesOrNone _EquivForDisplay(CAtom& atom, nb::handle bracket);
    CBytesOrNone _EquivForGrouping(CAtom& atom, const CBytesOrNone& extra_trailer);
    CBytesOrNone _EquivForTuple(CTestListStarExpr& tuple);
    CBytesOrNone _EquivForLiteral(CNode& node);
    CBytesOrNone _EquivForNumber(CNumberLiteral& number, const CTextOrNone& sign = {});
    CBytesOrNone _EquivForString(CStringLiteral& literal);
    CBytesOrNone _EquivForOperators(CNode& node, const CBytesOrNone& extra_trailer);
    CBytesOrNone _InstanceNameForString(CStringLiteral& literal);

    CRef<CLogicalLine> _fLogical;       // the line being walked; it guards against re-entry
    bool _fLoadNameContext = true;      // a name that is met is read; false below a target
    bool _fStoreWithinSubExpr = false;  // below a target: one of a comprehension or a lambda
    // What parentheses that are no tuple's hold. So nested ones are told from a tuple's but once.
    const CNode* _fInnerGrouping = nullptr;
    CChainText* _fChainText = nullptr;  // of the chain that is being visited
    CNamesFound _fNames;
    CVisitLimits _fVisits;
    int _fRecurseCount = 0;
};

template <class Class>
class TNodeWalkerOperations : public Class {
    FIRST_OPERATIONS
    OPERATION(
        Walk,
        "Walk the tree of a logical line and record on the line what it says. A walk of too many visits "
        "or too deep ends with a line on the standard output. ValueError while a walk is under way, "
        "SyntaxError for what parses but isn't allowed.",
        "node"_a.none(), "logical"_a)
    OPERATION(_ProcessNamesFound,
              "Record the names read, then those bound within sub-expressions. `node` is the root; an import "
              "reads nothing.",
              "node"_a)
    OPERATION(_VisitChildren, "Visit each direct child, in order.", "node"_a)
    OPERATION(_RaiseIfNotInstance, "ValueError unless `node` is an instance of `cls`.", "node"_a.none(),
              "cls"_a)
    OPERATION(
        _VisitNode,
        "Visit a node: count, limit, dispatch by its class. RuntimeError beyond 10000 visits or a depth "
        "of 40.",
        "node"_a)
    OPERATION(_VisitStoreContextNode,
              "Visit a target. With `within_sub_expr` its names are bound within a sub-expression of the "
              "line: a comprehension, a lambda.",
              "node"_a, "within_sub_expr"_a = false)
    OPERATION(_VisitLoadContextNode, "Visit a value, be it below a target.", "node"_a)
    OPERATION(_VisitCompForNode, "A `for` clause of a comprehension and the clauses behind it.", "node"_a)
    OPERATION(_VisitNameLiteral,
              "A name: alone, or of a chain of `atom_node` and `all_trailers`, in the trailer at `trailer_i` "
              "or, with -1, as the atom itself.",
              "node"_a, "atom_node"_a.none() = nb::none(), "all_trailers"_a.none() = nb::none(),
              "trailer_i"_a = -1)
    OPERATION(_VisitDottedName, "Each prefix of `a.b.c` is read: `a`, `a.b`, `a.b.c`.", "node"_a)
    OPERATION(_ProcessLoadName, "Note a name, a text string, as read.", "name"_a.none())
    OPERATION(_VisitImportNames, "`import a.b` binds `a`, `import a.b as c` binds `c`.", "node"_a)
    OPERATION(_VisitFromImport, "`from m import a as b` binds `b`; a star is recorded as the name `*`.",
              "node"_a)
    OPERATION(_VisitExprStmt, "An assignment of one of the three forms.", "node"_a)
    OPERATION(_VisitWithItem, "`a as b` of a `with`.", "node"_a)
    OPERATION(_VisitFuncdef, "The header of a `def`; its body isn't visited.", "node"_a)
    OPERATION(_VisitLambdaExpr, "A lambda.", "node"_a)
    OPERATION(_ProcessLambdaDefiningArgList,
              "The arguments of a lambda, a list of CArgInfo: bound within the expression.", "arg_list"_a)
    OPERATION(_VisitGlobalStmt, "Record each name of `global`.", "node"_a)
    OPERATION(_VisitNonlocalStmt, "Record each name of `nonlocal`.", "node"_a)
    OPERATION(_VisitParameters, "The parameters of a `def`.", "node"_a)
    OPERATION(
        _ProcessDefiningArgList,
        "Record the arguments of a `def`, a list of CArgInfo and, for the tuple parameters of Python 2, "
        "of such lists. AssertionError for any other item.",
        "arg_list"_a)
    OPERATION(_VisitAssignment, "`a = b = c`.", "node"_a)
    OPERATION(_VisitForStmt, "A `for` line.", "node"_a)
    OPERATION(
        _ProcessTargets,
        "Pair the names of a target with what they receive of `rhs`, be it ((a, b), c) = ... or a, *b = "
        "... `extra_trailer`, bytes, tells which part of `rhs` the whole target receives.",
        "lhs"_a, "rhs"_a.none(), "extra_trailer"_a.none() = nb::none())
    OPERATION(_VisitAugAssign, "`a += b`: both are read, nothing is bound.", "node"_a)
    OPERATION(_VisitAnnotatedAssign, "`a: b = c`; without a value nothing is bound.", "node"_a)
    OPERATION(_VisitReturn, "Record the value under the name \"return\".", "return_stmt"_a)
    OPERATION(_VisitYield, "Record the value under the name \"yield\".", "yield_expr"_a)
    OPERATION(_VisitPower, "A power, and in the 2.7 grammar any chain.", "node"_a)
    OPERATION(_VisitAtomExpr, "A chain.", "node"_a)
    OPERATION(_VisitAtomPlusTrailers, "An atom and its trailers, from left to right.", "atom_node"_a,
              "all_trailers"_a)
    OPERATION(_VisitCall, "The call of what an atom and the trailers behind it give.", "atom"_a,
              "prev_trailers"_a, "arglist"_a)
    OPERATION(_ProcessFunctionCall,
              "Visit the arguments of a call, a list of CArgInfo, and record the call of `func_name`, UTF-8 "
              "or None. SyntaxError for a bare generator beside another argument.",
              "func_name"_a.none(), "arg_list"_a)
    OPERATION(_VisitSingleDecorator, "A decorator, which is a call also without brackets.", "node"_a)
    OPERATION(_ProcessIsInstanceCall, "Record what `isinstance(a, b)` says of `a`.", "arg_list"_a)
    OPERATION(_VisitClassdef, "The header of a class; its body isn't visited.", "classdef_node"_a)
    OPERATION(_VisitExceptClause, "An `except` line. SyntaxError for a target that isn't a name.",
              "exc_clause"_a)
    OPERATION(_AppendEquivNode,
              "Record a name as bound, unless its text holds \"[\", and what its value stands for.",
              "name_node"_a, "equiv_node"_a.none(), "extra_trailer"_a.none() = nb::none())
    OPERATION(_AppendSubscriptedEquivNode,
              "Record a name as bound, and as the item `subscript` of a value; -1 is any item.",
              "name_node"_a, "equiv_node"_a.none(), "subscript"_a = -1)
    OPERATION(_AddNodeInfoStr, "Record `istr` for the name that a node shows.", "name_node"_a,
              "istr"_a.none())
    OPERATION(_TypeEquivForNode,
              "What a value stands for, as a record; None when that can't be told. `extra_trailer`, bytes, "
              "stands behind it where a part of the value is meant.",
              "node"_a, "extra_trailer"_a.none() = nb::none())
    OPERATION(
        _TypeEquivForOperatorExpression,
        "An operator expression with each operand replaced by what it stands for; None when one of them "
        "can't be told.",
        "op_expr"_a)
    OPERATION(_VisitNamedExpr, "`a := b`, as an expression or as an argument. AssertionError for others.",
              "node"_a)
    OPERATION(_VisitCaseStmt, "A `case` line.", "case_stmt"_a)
    OPERATION(_VisitMatchStmt, "A `match` line.", "match_stmt"_a)
    OPERATION(_VisitPatternNode, "A pattern: captures are bound, values and classes are read.",
              "pattern_node"_a)
    OPERATION(_VisitTypeParameter, "A type parameter (PEP 695).", "type_param"_a)
    OPERATION(_AddNameDefined, "Record a name, text or UTF-8, as bound.", "name"_a)
    OPERATION(_AddArgNameDefined, "Record a name, text or UTF-8, as an argument.", "name"_a)
    OPERATION(_AddTypeEquiv, "Append a record, text or UTF-8, to the line's; without a line nothing.",
              "name"_a, "equiv"_a)
    OPERATION(_AddArgInfoBytes, "Append a record, text or UTF-8, to those of the line's arguments.", "name"_a,
              "ibytes"_a)
    END_OPERATIONS
};

void BindNodeWalker(nb::module_& module);

}  // namespace codeloom
