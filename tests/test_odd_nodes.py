"""What the accessors of all node classes answer for nodes that no parser makes."""

import inspect
from contextlib import suppress

import pytest
from hand_made import Leaf, Node

from codeloom import treesift
from codeloom.treesift import CCompForNode, CKeywordLiteral, CNameLiteral

ITSELF = object()

# What each accessor answers, or raises: for a leaf, for an empty list of children, for eight foreign ones.
ODD_NODES = """
CExpression.GetSubExpr                              None       None       None
CExpression.GetSubExprCount                         0          0          0
COperatorExpression.GetOperatorStr                  None       None       TypeError
COperatorExpression.GetTermCount                    0          0          5
COperatorExpression.GetTerm                         None       None       TypeError
CStarExpression.GetStarredExpression                TypeError  IndexError TypeError
CLambdaExpr.GetArgumentsNode                        TypeError  IndexError TypeError
CLambdaExpr.GetBodyExpr                             TypeError  IndexError TypeError
CYieldExpr.GetValue                                 None       None       TypeError
CYieldExpr.IsYieldFrom                              False      False      False
CYieldArg.GetValue                                  TypeError  IndexError TypeError
CYieldArg.IsYieldFrom                               False      False      False
CTestListStarExpr.GetSubExpr                        ValueError ValueError ValueError
CTestListStarExpr.GetSubExprCount                   0          0          4
CTestListStarExpr.IsTuple                           False      False      TypeError
CTestListStarExpr.IsGenExpr                         False      False      False
CAtomExpr.GetPrefix                                 None       None       None
CAtomExpr.GetAtom                                   None       IndexError TypeError
CAtomExpr.GetTrailers                               []         []         [1,2,3,4,5,6,7]
CPower.GetAtom                                      TypeError  IndexError TypeError
CPower.GetTrailers                                  TypeError  IndexError TypeError
CPower.GetExponentNode                              None       None       TypeError
CFactorExpr.GetUnaryOperator                        None       None       TypeError
CNamedExpr.GetAssignedName                          TypeError  IndexError TypeError
CNamedExpr.GetRightHandExpression                   TypeError  IndexError TypeError
CCompForNode.IsAsync                                False      False      TypeError
CCompForNode.GetTargetNode                          TypeError  IndexError TypeError
CCompForNode.GetInNode                              TypeError  IndexError TypeError
CCompForNode.GetCompIterNode                        None       None       TypeError
CListmakerNode.GetSubExprCount                      TypeError  IndexError TypeError
CListmakerNode.GetSubExpr                           TypeError  IndexError TypeError
CTrailer.GetDotName                                 None       None       None
CTrailer.GetNestedNode                              None       None       None
CTrailer.GetInitialToken                            ValueError ValueError TypeError
CNumberLiteral.IsFloat                              TypeError  TypeError  TypeError
CNumberLiteral.GetNumericValue                      TypeError  TypeError  TypeError
CStringLiteral.IsUnicode                            False      False      False
CStringLiteral.IsBytes                              False      False      False
CStringLiteral.GetStringContents                    TypeError  TypeError  TypeError
CStringLiteral.GetStringValue                       TypeError  TypeError  TypeError
CAtom.GetSubExpr                                    ValueError ValueError TypeError
CAtom.GetSubExprCount                               ValueError ValueError TypeError
CAtom.GetInitialBracket                             ValueError ValueError TypeError
CAtom.IsLiteral                                     True       True       True
CAtom.IsComprehension                               False      False      False
CAtom.IsTwoPlusStringLiterals                       False      False      False
CClassdefStmt.GetClassName                          None       None       TypeError
CClassdefStmt.GetBaseClassList                      []         []         TypeError
CFuncdefStmt.GetFunctionName                        None       None       TypeError
CFuncdefStmt.GetParameters                          TypeError  IndexError TypeError
CFuncdefStmt.GetReturnType                          None       None       TypeError
CFuncdefStmt.GetSuite                               None       None       TypeError
CIfStmt.GetTestExpression                           TypeError  IndexError TypeError
CMatchStmt.GetTestExpression                        TypeError  IndexError TypeError
CCaseStmt.GetPattern                                TypeError  IndexError TypeError
CCaseStmt.GetGuard                                  None       None       TypeError
CCaseStmt.GetBody                                   TypeError  IndexError TypeError
CDelStmt.GetExpressions                             []         []         []
CSingleDecorator.GetDottedName                      TypeError  IndexError TypeError
CSingleDecorator.GetUsedArgList                     []         []         TypeError
CGlobalStmt.GetUtf8NameList                         TypeError  []         []
CNonlocalStmt.GetUtf8NameList                       TypeError  []         []
CForStmt.GetTarget                                  TypeError  IndexError TypeError
CForStmt.GetInExpression                            TypeError  IndexError TypeError
CForStmt.GetBody                                    TypeError  IndexError TypeError
CForStmt.GetElseBody                                None       None       TypeError
CWithStmt.GetWithItems                              TypeError  []         []
CWithItem.GetExpression                             TypeError  IndexError TypeError
CWithItem.GetTarget                                 TypeError  IndexError TypeError
CExceptClause.GetExceptionType                      None       None       TypeError
CExceptClause.GetTarget                             None       None       TypeError
CExprStmt.GetEqualCount                             TypeError  0          TypeError
CExprStmt.GetAnnotatedAssignNode                    None       None       None
CExprStmt.GetInitialTestExpr                        TypeError  IndexError TypeError
CExprStmt.GetPostEqualsTestExpr                     TypeError  ValueError TypeError
CExprStmt.GetAugAssignOp                            None       None       TypeError
CAnnotatedAssignNode.GetTypeHintNode                TypeError  IndexError TypeError
CAnnotatedAssignNode.GetPostEqualsTestExpr          None       None       TypeError
CReturnStmt.GetValue                                None       None       TypeError
CTypeParameter.GetName                              None       IndexError TypeError
CTypeParameter.GetPrefix                            None       None       TypeError
CTypeParameter.GetSpecNode                          None       None       TypeError
CWithTypeParameters.GetTypeParameters               TypeError  []         TypeError
CWithTypeParameters.GetTypeParameterScopedStatement TypeError  IndexError TypeError
CImportNamesStmt.GetAsNameList                      TypeError  IndexError TypeError
CFromImportStmt.GetFromString                       None       None       TypeError
CFromImportStmt.GetImportStar                       False      False      TypeError
CFromImportStmt.GetAsNameList                       TypeError  IndexError TypeError
CFromImportStmt._GetImportIndex                     -1         -1         TypeError
CSingleUsedArgumentNode.GetPrefix                   None       None       TypeError
CSingleUsedArgumentNode.GetName                     None       None       TypeError
CSingleUsedArgumentNode.GetValue                    ITSELF     ITSELF     TypeError
CSingleUsedArgumentNode.IsUnparenthesizedGenExpr    False      False      False
CSingleUsedArgumentNode.GetNameAssigned             None       None       TypeError
CSingleUsedArgumentNode.GetNamedRightHandExpression None       None       TypeError
CFunctionParameterDef.GetNestedListNode             None       None       None
CFunctionParameterDef.GetName                       None       None       TypeError
CFunctionParameterDef.GetTypeExpr                   None       None       None
"""
ROWS = [row.split() for row in ODD_NODES.strip().splitlines()]
INDEXED = {"GetSubExpr", "GetTerm", "GetOperatorStr", "CExprStmt.GetPostEqualsTestExpr"}


def Ask(node, operation):
    accessor = operation.partition(".")[2]
    return getattr(node, accessor)(*[0] * (not INDEXED.isdisjoint((accessor, operation))))


@pytest.mark.parametrize("row", ROWS, ids=[row[0] for row in ROWS])
def test_odd_nodes(row):
    cls = getattr(treesift, row[0].partition(".")[0])
    nodes = Leaf(cls=cls), Node(cls), Node(cls, *range(8))
    for node, answer in zip(nodes, map(eval, row[1:]), strict=True):
        if inspect.isclass(answer):
            with pytest.raises(answer):
                Ask(node, row[0])
        else:
            assert Ask(node, row[0]) == (node if answer is ITSELF else answer)


def test_the_rows_are_complete():
    told = {tuple(row[0].split(".")) for row in ROWS}
    for class_name in {class_name for class_name, _ in told}:
        for name, value in vars(getattr(treesift, class_name)).items():
            assert name.startswith("__") or not callable(value) or (class_name, name) in told


@pytest.mark.parametrize("row", ROWS, ids=[row[0] for row in ROWS])
def test_short_lists_never_crash(row):
    cls = getattr(treesift, row[0].partition(".")[0])
    for child in (
        None,
        1,
        Leaf("x", cls=CNameLiteral),
        Leaf("async", cls=CKeywordLiteral),
        Node(CCompForNode),
    ):
        for count in range(1, 5):
            with suppress(TypeError, IndexError, ValueError, AttributeError):
                Ask(Node(cls, *[child] * count), row[0])
