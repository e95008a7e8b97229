# Made by tools/make_stubs.py; don't edit.
from codeloom import _neighbours
from codeloom._neighbours import CLogicalLine, FindMatchOrCaseType
__all__ = ['CLogicalLine', 'FindMatchOrCaseType', 'IsScopeStartLogical', 'kUnknown', 'kClassDef', 'kFunctionDef', 'kStringExpression', 'kAssignment', 'kIfBeginning', 'kElseBeginning', 'kWhileBeginning', 'kForBeginning', 'kPass', 'kRaise', 'kTry', 'kExcept', 'kFinally', 'kAssert', 'kReturn', 'kImport', 'kFromImport', 'kPrint', 'kDelete', 'kElifBeginning', 'kComment', 'kBlankLine', 'kBreak', 'kContinue', 'kWith', 'kMatch', 'kCase', 'kFstringFieldExp', 'kCommentedTypeHint', 'kStringifiedTypeHint', 'kTypeStatement', 'kErrorTokenPrefix']
kUnknown: str
kClassDef: str
kFunctionDef: str
kStringExpression: str
kAssignment: str
kIfBeginning: str
kElseBeginning: str
kWhileBeginning: str
kForBeginning: str
kPass: str
kRaise: str
kTry: str
kExcept: str
kFinally: str
kAssert: str
kReturn: str
kImport: str
kFromImport: str
kPrint: str
kDelete: str
kElifBeginning: str
kComment: str
kBlankLine: str
kBreak: str
kContinue: str
kWith: str
kMatch: str
kCase: str
kFstringFieldExp: str
kCommentedTypeHint: str
kStringifiedTypeHint: str
kTypeStatement: str
kErrorTokenPrefix: str
def IsScopeStartLogical(logical: CLogicalLine) -> bool:
    """True when a logical opens a scope: the header of a class or a def."""
    ...
