// walker/: what one logical line does with names.
//   in     the typed tree of one line, and its CLogicalLine
//   out    records appended to that line, in the order in which the walk meets what they say; the names read
//          come at the end
//   keeps  nothing from one line to the next, but its limits and its text converter
//   start  at CNodeWalker::Walk, then the table in dispatch.cpp
//
// loads.cpp          names, chains, calls, comprehensions, decorators
// definitions.cpp    `def`, `lambda`, `class`, imports, `global`, type parameters
// targets.cpp        assignments: the names on the left with what is on the right
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

    OPERATIONS_OF(CNodeWalker, CNoOperations)
    OPERATION(
        void, Walk, (CNodeRef node, CLogicalLine& logical),
        "Walk the tree of a logical line and record on the line what it says. A walk of too many visits "
        "or too deep ends with a line on the standard output. ValueError while a walk is under way, "
        "SyntaxError for what parses but isn't allowed.",
        "node"_a.none(), "logical"_a);
    OPERATION(void, _ProcessNamesFound, (CNode& node),
              "Record the names read, then those bound within sub-expressions. `node` is the root; an import "
              "reads nothing.",
              "node"_a);
    OPERATION(void, _VisitChildren, (CNode& node), "Visit each direct child, in order.", "node"_a);
    OPERATION(void, _RaiseIfNotInstance, (nb::handle node, nb::handle cls),
              "ValueError unless `node` is an instance of `cls`.", "node"_a.none(), "cls"_a);
    OPERATION(
        void, _VisitNode, (CNode& node),
        "Visit a node: count, limit, dispatch by its class. RuntimeError beyond 10000 visits or a depth "
        "of 40.",
        "node"_a);
    OPERATION(void, _VisitStoreContextNode, (CNode& node, bool within_sub_expr = false),
              "Visit a target. With `within_sub_expr` its names are bound within a sub-expression of the "
              "line: a comprehension, a lambda.",
              "node"_a, "within_sub_expr"_a = false);
    OPERATION(void, _VisitLoadContextNode, (CNode& node), "Visit a value, be it below a target.", "node"_a);
    OPERATION(void, _VisitCompForNode, (CCompForNode& node),
              "A `for` clause of a comprehension and the clauses after it.", "node"_a);
    OPERATION(void, _VisitNameLiteral,
              (CNameLiteral& node, CNodeRef atom_node = nullptr,
               std::optional<CNodeRange> all_trailers = std::nullopt, int trailer_i = -1),
              "A name: alone, or of a chain of `atom_node` and `all_trailers`, in the trailer at `trailer_i` "
              "or, with -1, as the atom itself.",
              "node"_a, "atom_node"_a.none()= nb::none(), "all_trailers"_a.none()= nb::none(),
              "trailer_i"_a = -1);
    OPERATION(void, _VisitDottedName, (CDottedName& node),
              "Each prefix of `a.b.c` is read: `a`, `a.b`, `a.b.c`.", "node"_a);
    OPERATION(void, _ProcessLoadName, (CTextOrNone name), "Note a name, a text string, as read.",
              "name"_a.none());
    OPERATION(void, _VisitImportNames, (CImportNamesStmt& node),
              "`import a.b` binds `a`, `import a.b as c` binds `c`.", "node"_a);
    OPERATION(void, _VisitFromImport, (CFromImportStmt& node),
              "`from m import a as b` binds `b`; a star is recorded as the name `*`.", "node"_a);
    OPERATION(void, _VisitExprStmt, (CExprStmt& node), "An assignment of one of the three forms.", "node"_a);
    OPERATION(void, _VisitWithItem, (CWithItem& node), "`a as b` of a `with`.", "node"_a);
    OPERATION(void, _VisitFuncdef, (CFuncdefStmt& node), "The header of a `def`; its body isn't visited.",
              "node"_a);
    OPERATION(void, _VisitLambdaExpr, (CLambdaExpr& node), "A lambda.", "node"_a);
    OPERATION(void, _ProcessLambdaDefiningArgList, (const CArgumentList& arg_list),
              "The arguments of a lambda, a list of CArgInfo: bound within the expression.", "arg_list"_a);
    OPERATION(void, _VisitGlobalStmt, (CGlobalStmt& node), "Record each name of `global`.", "node"_a);
    OPERATION(void, _VisitNonlocalStmt, (CNonlocalStmt& node), "Record each name of `nonlocal`.", "node"_a);
    OPERATION(void, _VisitParameters, (CParametersNode& node), "The parameters of a `def`.", "node"_a);
    OPERATION(
        void, _ProcessDefiningArgList, (const CArgumentList& arg_list),
        "Record the arguments of a `def`, a list of CArgInfo and, for the tuple parameters of Python 2, "
        "of such lists. AssertionError for any other item.",
        "arg_list"_a);
    OPERATION(void, _VisitAssignment, (CExprStmt& node), "`a = b = c`.", "node"_a);
    OPERATION(void, _VisitForStmt, (CForStmt& node), "A `for` line.", "node"_a);
    OPERATION(
        void, _ProcessTargets, (CNode& lhs, CNodeRef rhs, CBytesOrNone extra_trailer = CBytesOrNone()),
        "Pair the names of a target with what they receive of `rhs`, be it ((a, b), c) = ... or a, *b = "
        "... `extra_trailer`, bytes, tells which part of `rhs` the whole target receives.",
        "lhs"_a, "rhs"_a.none(), "extra_trailer"_a.none()= nb::none());
    OPERATION(void, _VisitAugAssign, (CExprStmt& node), "`a += b`: both are read, nothing is bound.",
              "node"_a);
    OPERATION(void, _VisitAnnotatedAssign, (CExprStmt& node), "`a: b = c`; without a value nothing is bound.",
              "node"_a);
    OPERATION(void, _VisitReturn, (CReturnStmt& return_stmt), "Record the value under the name \"return\".",
              "return_stmt"_a);
    OPERATION(void, _VisitYield, (CYieldExpr& yield_expr), "Record the value under the name \"yield\".",
              "yield_expr"_a);
    OPERATION(void, _VisitPower, (CPower& node), "A power, and in the 2.7 grammar any chain.", "node"_a);
    OPERATION(void, _VisitAtomExpr, (CAtomExpr& node), "A chain.", "node"_a);
    OPERATION(void, _VisitAtomPlusTrailers, (CNode& atom_node, const CNodeRange& all_trailers),
              "An atom and its trailers, from left to right.", "atom_node"_a, "all_trailers"_a);
    OPERATION(void, _VisitCall, (CNode& atom, const CNodeRange& prev_trailers, CNode& arglist),
              "The call of what an atom and the trailers after it give.", "atom"_a, "prev_trailers"_a,
              "arglist"_a);
    OPERATION(void, _ProcessFunctionCall, (CBytesOrNone func_name, const CArgumentList& arg_list),
              "Visit the arguments of a call, a list of CArgInfo, and record the call of `func_name`, UTF-8 "
              "or None. SyntaxError for a bare generator beside another argument.",
              "func_name"_a.none(), "arg_list"_a);
    OPERATION(void, _VisitSingleDecorator, (CSingleDecorator& node),
              "A decorator, which is a call also without brackets.", "node"_a);
    OPERATION(void, _ProcessIsInstanceCall, (const CArgumentList& arg_list),
              "Record what `isinstance(a, b)` says of `a`.", "arg_list"_a);
    OPERATION(void, _VisitClassdef, (CClassdefStmt& classdef_node),
              "The header of a class; its body isn't visited.", "classdef_node"_a);
    OPERATION(void, _VisitExceptClause, (CExceptClause& exc_clause),
              "An `except` line. SyntaxError for a target that isn't a name.", "exc_clause"_a);
    OPERATION(void, _AppendEquivNode,
              (CNode& name_node, CNodeRef equiv_node, CBytesOrNone extra_trailer = CBytesOrNone()),
              "Record a name as bound, unless its text holds \"[\", and what its value stands for.",
              "name_node"_a, "equiv_node"_a.none(), "extra_trailer"_a.none()= nb::none());
    OPERATION(void, _AppendSubscriptedEquivNode,
              (CNode& name_node, CNodeRef equiv_node, Py_ssize_t subscript = -1),
              "Record a name as bound, and as the item `subscript` of a value; -1 is any item.",
              "name_node"_a, "equiv_node"_a.none(), "subscript"_a = -1);
    OPERATION(void, _AddNodeInfoStr, (CNode& name_node, CTextOrUtf8OrNone istr),
              "Record `istr` for the name that a node shows.", "name_node"_a, "istr"_a.none());
    OPERATION(CBytesOrNone, _TypeEquivForNode, (CNode& node, CBytesOrNone extra_trailer = CBytesOrNone()),
              "What a value stands for, as a record; None when that isn't known. `extra_trailer`, bytes, "
              "follows it where a part of the value is meant.",
              "node"_a, "extra_trailer"_a.none()= nb::none());
    OPERATION(
        CBytesOrNone, _TypeEquivForOperatorExpression, (COperatorExpression& op_expr),
        "An operator expression with each operand replaced by what it stands for; None when one of them "
        "isn't known.",
        "op_expr"_a);
    OPERATION(void, _VisitNamedExpr, (CNode& node),
              "`a := b`, as an expression or as an argument. AssertionError for others.", "node"_a);
    OPERATION(void, _VisitCaseStmt, (CCaseStmt& case_stmt), "A `case` line.", "case_stmt"_a);
    OPERATION(void, _VisitMatchStmt, (CMatchStmt& match_stmt), "A `match` line.", "match_stmt"_a);
    OPERATION(void, _VisitPatternNode, (CPatternNode& pattern_node),
              "A pattern: captures are bound, values and classes are read.", "pattern_node"_a);
    OPERATION(void, _VisitTypeParameter, (CTypeParameter& type_param), "A type parameter (PEP 695).",
              "type_param"_a);
    OPERATION(void, _AddNameDefined, (CTextOrUtf8 name), "Record a name, text or UTF-8, as bound.", "name"_a);
    OPERATION(void, _AddArgNameDefined, (CTextOrUtf8 name), "Record a name, text or UTF-8, as an argument.",
              "name"_a);
    OPERATION(void, _AddTypeEquiv, (CTextOrUtf8 name, CTextOrUtf8 equiv),
              "Append a record, text or UTF-8, to the line's; without a line nothing.", "name"_a, "equiv"_a);
    OPERATION(void, _AddArgInfoBytes, (CTextOrUtf8 name, CTextOrUtf8 ibytes),
              "Append a record, text or UTF-8, to those of the line's arguments.", "name"_a, "ibytes"_a);
    END_OPERATIONS

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
    // What parentheses hold that aren't a tuple's: nested ones are looked at only once.
    const CNode* _fInnerGrouping = nullptr;
    CChainText* _fChainText = nullptr;  // of the chain that is being visited
    CNamesFound _fNames;
    CVisitLimits _fVisits;
    int _fRecurseCount = 0;
};

void BindNodeWalker(nb::module_& module);

}  // namespace codeloom
