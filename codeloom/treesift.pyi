# Made by tools/make_stubs.py; don't edit.
import typing
from collections.abc import Sized
from codeloom import _fastaccess as _fastaccess, logicalinspect as logicalinspect, logicalline as logicalline, optpgen as optpgen, strutils as strutils, symbolinfo as symbolinfo, utils as utils
from codeloom._fastaccess import CLogger as CLogger
import codeloom._neighbours
from codeloom._neighbours import AsStr as AsStr, AsUtf8 as AsUtf8, BuildLiteralInfo as BuildLiteralInfo, BytesForInteger as BytesForInteger, CKindFilter as CKindFilter, CLogicalLine as CLogicalLine, CNonNestedSearch as CNonNestedSearch, CStringTokenizer as CStringTokenizer, EncodeStringLiteral as EncodeStringLiteral, EnsureScopeNameIndicies as EnsureScopeNameIndicies, GetInstanceNameForClass as GetInstanceNameForClass, GetTokenType as GetTokenType, IsUtf8LeadByte as IsUtf8LeadByte, JoinTokens as JoinTokens, Parser as Parser, Utf8Concat5 as Utf8Concat5, Utf8Len as Utf8Len, _FindStringEndNonNested as _FindStringEndNonNested, _NonInlineNextNonNestedUtf8PtrIndex as _NonInlineNextNonNestedUtf8PtrIndex, _NonInlineUcs4CharAtUtf8Pos as _NonInlineUcs4CharAtUtf8Pos
from codeloom._standins import config as config
from codeloom._standins.bytebuffer import CEncodedByteBufferReader as CEncodedByteBufferReader, CWritableByteBuffer as CWritableByteBuffer
from codeloom._standins.tarnbase.destroyable import CDestroyable as CDestroyable, _CEmissionStackItem as _CEmissionStackItem, _CHandlerRecord as _CHandlerRecord
from codeloom._standins.tarnutils import reflect as reflect
from codeloom.strutils import TextPosInfo as TextPosInfo, _CTextPosInfo as _CTextPosInfo
import codeloom.symbolinfo
from codeloom.symbolinfo import BuildArgInfo as BuildArgInfo, CArgTextInfo as CArgTextInfo, CDefInfo as CDefInfo, CFullyScopedName as CFullyScopedName, CInfoBytesBuilder as CInfoBytesBuilder, CLocationCache as CLocationCache, CSingleResolvedInfo as CSingleResolvedInfo, ObjectForStringLiteral as ObjectForStringLiteral
kUnknown: str = 'unknown'
kClassDef: str = 'class'
kFunctionDef: str = 'def'
kStringExpression: str = 'string expression'
kAssignment: str = 'assignment'
kIfBeginning: str = 'if'
kElseBeginning: str = 'else'
kWhileBeginning: str = 'while'
kForBeginning: str = 'for'
kPass: str = 'pass'
kRaise: str = 'raise'
kTry: str = 'try'
kExcept: str = 'except'
kFinally: str = 'finally'
kAssert: str = 'assert'
kReturn: str = 'return'
kImport: str = 'import'
kFromImport: str = 'from import'
kPrint: str = 'print'
kDelete: str = 'del'
kElifBeginning: str = 'elif'
kComment: str = 'comment'
kBlankLine: str = 'blank line'
kBreak: str = 'break'
kContinue: str = 'continue'
kWith: str = 'with'
kMatch: str = 'match'
kCase: str = 'case'
kFstringFieldExp: str = 'f-string field'
kCommentedTypeHint: str = 'commented type hint'
kStringifiedTypeHint: str = 'stringified type hint'
kTypeStatement: str = 'type'
kErrorTokenPrefix: str = 'error token'
kSetPrefix: bytes = ...
kSetKind: int = 115
kGetPrefix: bytes = ...
kGetKind: int = 103
kGlobalPrefix: bytes = ...
kGlobalKind: int = 71
kNonlocalPrefix: bytes = ...
kNonlocalKind: int = 78
kWithinExprPrefix: bytes = ...
kWithinExprKind: int = 119
kImportPrefix: bytes = ...
kImportKind: int = 105
kFromImportPrefix: bytes = ...
kFromImportKind: int = 102
kImportAsNamePrefix: bytes = ...
kImportAsNameKind: int = 110
kCalledPrefix: bytes = ...
kCalledKind: int = 99
kTypedLiteralPrefix: bytes = ...
kTypedLiteralKind: int = 108
kExpressionEquivPrefix: bytes = ...
kExpressionEquivKind: int = 101
kTypeParameterPrefix: bytes = ...
kTypeParameterKind: int = 112
kTypeHintPrefix: bytes = ...
kTypeHintKind: int = 104
kSetTypeHintPrefix: bytes = ...
kSetTypeHintKind: int = 72
kDecoratorPrefix: bytes = ...
kDecoratorKind: int = 100
kSpecificScopePrefix: bytes = ...
kSpecificScopeKind: int = 120
kSpecificUrlPrefix: bytes = ...
kSpecificUrlKind: int = 117
kBuiltinModulePrefix: bytes = ...
kBuiltinModuleKind: int = 98
kTypingModulePrefix: bytes = ...
kTypingModuleKind: int = 116
kBuiltinClassPrefix: bytes = ...
kBuiltinClassKind: int = 66
kArgPrefix: bytes = ...
kArgKind: int = 97
kMethodPrefix: bytes = ...
kMethodKind: int = 109
kUnboundMethodPrefix: bytes = ...
kUnboundMethodKind: int = 85
kFunctionPrefix: bytes = ...
kFunctionKind: int = 70
kClassPrefix: bytes = ...
kClassKind: int = 67
kSelfPrefix: bytes = ...
kSelfKind: int = 83
kInstancePrefix: bytes = ...
kInstanceKind: int = 73
kModulePrefix: bytes = ...
kModuleKind: int = 77
kInferredTypeHintPrefix: bytes = ...
kInferredTypeHintKind: int = 121
kConditionalPrefix: bytes = ...
kConditionalKind: int = 113
kGenericTypeAliasPrefix: bytes = ...
kGenericTypeAliasKind: int = 84
kDefLineScopePrefix: bytes = ...
kDefLineScopeKind: int = 68
kPlainEquivSpec: bytes = ...
kPlainEquivKind: int = 80
kPrefixLen: int = 3
kIterationSubscript: bytes = ...
kClassInstanceSuffix: bytes = ...
kScopeIndexSep: str = '#'
kModuleScopeName: str = ''
kWildcardScope: str = '*'
kDefLineScopeName: str = '<def>'
_kDotLineScopeName: str = '.<def>'
kTypingModuleSymbol: bytes = ...
kTypingModuleSymbolDot: bytes = ...
kTypingModuleSymbolDotAny: bytes = ...
kTypingModuleSymbolStr: str = 'typing'
kTypingModuleSymbolDotAnyStr: str = 'typing.Any'
kTypingModuleSymbolDotStr: str = 'typing.'
gInfoBytesBuilder: codeloom.symbolinfo.CInfoBytesBuilder = ...

def OrdAt(s: bytes | str, i: int) -> int:
    """
    The byte of a byte string or the code point of a text string at index `i`, from the end if
    negative. IndexError outside the string, TypeError for anything else.
    """

def Utf8Concat2(s0: bytes | str | None, s1: bytes | str | None) -> bytes:
    """Both joined as UTF-8; None contributes nothing."""

def Utf8Concat3(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None) -> bytes:
    """The three joined as UTF-8; None contributes nothing."""

def Utf8Concat4(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None, s3: bytes | str | None) -> bytes:
    """The four joined as UTF-8; None contributes nothing."""

def GetUtf8Ptr(u: bytes | str) -> bytes:
    """
    The UTF-8 bytes of a byte or text string, as AsUtf8 gives them. TypeError for anything else.
    """

def AdjustUtf8Pos(utf8_ptr: bytes | str, pos: int, diff: int, end_pos: int) -> int:
    """
    The byte offset of the character that lies `diff` characters after (before, if negative) the one
    that byte `pos` is part of; -1 or `end_pos` when it isn't in the buffer. A `pos` outside the
    buffer isn't part of a character, and each byte between it and the buffer counts as one.
    ValueError when `end_pos` lies outside the buffer.
    """

def Ucs4CharAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> str:
    """
    The character at byte `pos`, a text string of one: "\\0" when `pos` isn't in the buffer, U+FFFD
    where no well-formed character begins. ValueError when `end_pos` lies outside the buffer.
    """

def IsSpaceAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> bool:
    """
    True when the character at byte `pos` is a blank; False when `pos` isn't in the buffer.
    ValueError when `end_pos` lies outside the buffer.
    """

def IsDigitAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> bool:
    """
    True when the character at byte `pos` is a digit; False when `pos` isn't in the buffer.
    ValueError when `end_pos` lies outside the buffer.
    """

def IsAlnumAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> bool:
    """
    True when the character at byte `pos` is a letter or a numeric character; False when `pos` isn't
    in the buffer. ValueError when `end_pos` lies outside the buffer.
    """

def IsIdentifierCharAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int, initial: bool) -> bool:
    """
    True when the character at byte `pos` could be part of a name, its first character if `initial`;
    False when `pos` isn't in the buffer. Beyond ASCII, a character that is neither a name on its own nor
    a digit is refused. ValueError when `end_pos` lies outside the buffer.
    """

def PtrFindByte(ptr: bytes | str, length: int, c: int | bytes | str, start: int) -> int:
    """
    The offset of the first byte `c` in ptr[start:length]; -1 when there is none. ValueError unless
    0 <= start < length, and when `length` lies outside the buffer.
    """

def BytesFindByte(b: bytes, c: int | bytes | str, start: int=0) -> int:
    """
    The offset of the first byte `c` in b[start:]; -1 when there is none. ValueError unless
    0 <= start < len(b), TypeError when `b` isn't a byte string.
    """

def InitNonNestedStruct(structure: CNonNestedSearch, search_ptr: bytes | str | None, to_find_bytes: bytes, start: int, end: int) -> int:
    """
    Search the UTF-8 bytes start..end of a byte or text string for `to_find_bytes`; None is for no
    text at all. Returns 0. TypeError for anything else, AssertionError when `start` or `end` lies
    outside the text.
    """

def FindNextNonNestedStruct(structure: CNonNestedSearch) -> int:
    """
    The byte offset of the next hit outside brackets and strings; -1 when there is none.
    """

def StrInStr(sub: bytes, whole: bytes) -> bool:
    """
    True when `sub` occurs in `whole`, where a zero byte ends either of them. TypeError unless both
    are byte strings.
    """

def IsAlnum(c: int | bytes | str) -> bool:
    """True for the byte of an ASCII letter or digit."""

def IsDigit(c: int | bytes | str) -> bool:
    """True for the byte of an ASCII digit."""

def ULongLongValueForDoubleBits(f: float) -> int:
    """The unsigned integer with the 64 bits of a float."""

def DoubleValueForULongLongBits(l: int) -> float:
    """
    The float with the bits of an unsigned integer. OverflowError when that is negative or has more
    than 64 bits.
    """

def DoubleValueForPyIntBits(l: int) -> float:
    """The float with the low 64 bits of an integer of any sign."""

def GetNowTime() -> float:
    """The time of day in seconds, as time.time() gives it."""

def OutOfTime(end_time: float) -> bool:
    """True from the moment `end_time`, in seconds, on."""

def LocationsEqual(loc1: object, loc2: object) -> bool:
    """True when both are the same object: locations are shared."""

def IsDefKind(kind: int | bytes | str) -> bool:
    """
    True for the kinds of what a `def` makes: functions, methods and unbound methods.
    """

def GetInfoBytesKind(ibytes_ptr: bytes | str) -> int:
    """
    The kind of a record, as an integer: its second byte when its first is ":", and kPlainEquivKind
    otherwise.
    """

def IsTopLevelModuleScope(scope: Sized) -> bool:
    """
    True for the module's own scope, which is empty. TypeError for what has no length.
    """

def IsDefLineScope(scope: str) -> bool:
    """
    True for the scope of a def line itself. TypeError unless `scope` is a text string.
    """

def IsParentOfDefLineScope(maybe_parent: str, def_line_scope: str) -> bool:
    """
    True when `maybe_parent`, a scope known to be related, is the one around a def line's scope: the
    lengths alone are compared. TypeError unless both are text strings.
    """

def NextNonNestedUtf8PtrIndex(utf8_ptr: bytes | str, pos: int, end_pos: int) -> int:
    """
    The byte index after `pos` that isn't nested: after the bracket or string that begins at `pos`,
    otherwise the next one. -1 when `pos` isn't in the buffer, ValueError when `end_pos` lies outside
    it. A prefix of a string is walked byte by byte.
    """
kPy2DefaultGrammar: str = 'Python-Grammar-2.7'
kPy3DefaultGrammar: str = 'Python-Grammar-3.8'
kLiteralPrefix: bytes = ...
kListInstanceName: bytes = ...
kDictInstanceName: bytes = ...
kSetInstanceName: bytes = ...
kTupleInstanceName: bytes = ...
kStringInstanceName: bytes = ...
kUnicodeInstanceName: bytes = ...
kBytesInstanceName: bytes = ...
kIntLiteralName: bytes = ...
kFloatLiteralName: bytes = ...

def _GetBuiltinInstanceName(cls_name: str) -> bytes:
    """The equiv of an instance of a builtin class, by the name of the class."""

class CPGenAnalyzer(codeloom._neighbours.NodeConverter):
    """What analyzes one logical line at a time; a host may derive its own."""

    def __init__(self) -> None:
        ...

    def AnalyzeSingleLogical(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool, first_in_def: bool=False) -> SyntaxError | None:
        """
        Analyze a single logical and return any exception (typically
               SyntaxError, but can be other errors). Note that exception is only
               returned if logical has not previously been parsed.
        """

class CNodeClassInfo:
    """
    One grammar state or token type of a factory: its class, number, name and free list.
    """

    def __init__(self, cls: object | None, nodetype: int, name: object | None) -> None:
        ...

    @property
    def fCls(self) -> type[CNode]:
        """The node class to make for this state."""

    @property
    def fNodeType(self) -> int:
        """Grammar state number or token type."""

    @property
    def fName(self) -> str | None:
        """Name of the state, such as "funcdef" or "NAME"; may be None."""

    @property
    def fFirstFree(self) -> CNode | None:
        """First node of the free list, or None."""

class CNode:
    """Base of all syntax tree nodes."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    @property
    def fChildren(self) -> list[CNode] | None:
        """List of child nodes in source order; None for a leaf."""

    @property
    def fText(self) -> str | None:
        """Token text; None for a non-terminal."""

    @property
    def fContext(self) -> object:
        """Token index of the node's (first) token."""

    @property
    def fClsInfo(self) -> CNodeClassInfo | None:
        """The record that made the node."""

    @property
    def fNextFree(self) -> CNode | None:
        """Link of the free list; stale while the node is in use."""

    def __repr__(self) -> str:
        ...

    def GetChildCount(self) -> int:
        """The number of direct children; 0 for a leaf."""

    def GetChildText(self, child_i: int) -> str | None:
        """
        The text of the child at `child_i`; None at or past the end, and for a child without text.
        A negative index counts from the end; IndexError below the start.
        """

    def GetChild(self, child_i: int) -> CNode | None:
        """
        The child at `child_i`; None at or past the end. A negative index counts from the end;
        IndexError below the start.
        """

    def GetStateName(self) -> str | None:
        """
        The name of the grammar state; the class name of a node without a class record.
        """

    def _DoesChildTextMatch(self, text: str) -> bool:
        """True when a direct child's text equals `text`."""
    kSupportedRules: list[str] = []

class CExpression(CNode):
    """Base class for all expressions."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetSubExpr(self, i: int) -> CExpression | None:
        """
        The sub-expression at index `i`: None in a plain expression and in a comprehension. ValueError past the end of a comma list, and where an item isn't a CExpression.
        """

    def GetSubExprCount(self) -> int:
        """
        The number of sub-expressions of a comma list: 0 for a plain expression, 1 for a comprehension that is without its brackets.
        """

class CIfElseExpression(CExpression):
    """E if condition else E."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...
    kSupportedRules: list[str] = ...

class COperatorExpression(CExpression):
    """op T, T op T, T op T op T expressions."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetOperatorStr(self, operator_i: int) -> str | None:
        """
        The text of the operator at `operator_i`, two words with one blank between them; None below the first and past the last.
        """

    def GetTermCount(self) -> int:
        """The number of operands; 1 for `not a`, 0 for a leaf."""

    def GetTerm(self, term_index: int) -> CNode | None:
        """
        The operand at `term_index`; None past the end. For `not a` it is `a`, whatever the index.
        """
    kSupportedRules: list[str] = ...

class CStarExpression(CExpression):
    """*n used as an expression."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetStarredExpression(self) -> CExpression | None:
        """The expression after the star."""
    kSupportedRules: list[str] = ["star_expr: '*' expr"]

class CDottedName(CExpression):
    """a.b.c in decorators and imports."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...
    kSupportedRules: list[str] = ["dotted_name: NAME ('.' NAME)*"]

class CLambdaExpr(CExpression):
    """Lambda."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetArgumentsNode(self) -> CNode | None:
        """The one parameter, or the list of parameters; None without parameters."""

    def GetBodyExpr(self) -> CNode | None:
        """The expression after the colon."""

class CTestExpr(CExpression):
    """Declared, with no rule and no state."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CYieldExpr(CExpression):
    """Yield."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetValue(self) -> CNode | None:
        """What is yielded; None for a bare `yield`."""

    def IsYieldFrom(self) -> bool:
        """True for `yield from`."""
    kSupportedRules: list[str] = ...

class CTestListStarExpr(CExpression):
    """Comma lists of expressions."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetSubExpr(self, i: int) -> CExpression | None:
        """
        The sub-expression at index `i`: None in a plain expression and in a comprehension. ValueError past the end of a comma list, and where an item isn't a CExpression.
        """

    def GetSubExprCount(self) -> int:
        """
        The number of sub-expressions of a comma list: 0 for a plain expression, 1 for a comprehension that is without its brackets.
        """

    def IsTuple(self) -> bool:
        """True for a comma list; False for a comprehension."""

    def IsGenExpr(self) -> bool:
        """True for a comprehension, which is here without its parentheses."""
    kSupportedRules: list[str] = ...

class CAtomExpr(CExpression):
    """[await] atom trailer*."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetPrefix(self) -> CNode | None:
        """
        The leaf of `await` before the atom; None without one, and where `await` is itself the name that the trailers belong to.
        """

    def GetAtom(self) -> CNode | None:
        """The atom before the trailers; None for a leaf."""

    def GetTrailers(self) -> list[CNode]:
        """The trailers after the atom, as a new list."""
    kSupportedRules: list[str] = ['atom_expr: [AWAIT] atom trailer*']

class CPower(CExpression):
    """Atom, trailers and exponent."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetAtom(self) -> CNode | None:
        """The atom before the trailers, under either grammar."""

    def GetTrailers(self) -> list[CNode]:
        """The trailers between the atom and `**`, as a new list."""

    def GetExponentNode(self) -> CNode | None:
        """The exponent; None without `**`."""
    kSupportedRules: list[str] = ...

class CFactorExpr(CExpression):
    """Unary +, -, ~."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetUnaryOperator(self) -> str | None:
        """"+", "-" or "~"; None for any other text."""

class CNamedExpr(CExpression):
    """:= expression."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetAssignedName(self) -> CNode | None:
        """The name before `:=`."""

    def GetRightHandExpression(self) -> CNode | None:
        """The expression after `:=`."""
    kSupportedRules: list[str] = ["namedexpr_test: test [':=' test]"]

class CBinaryOp(CNode):
    """Declared, with no rule and no state."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CYieldArg(CNode):
    """Argument of yield."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetValue(self) -> CNode | None:
        """What is yielded; None for a bare `yield`."""

    def IsYieldFrom(self) -> bool:
        """True for `yield from`."""
    kSupportedRules: list[str] = ["yield_arg: 'from' test | testlist"]

class CCompForNode(CNode):
    """
    A 'for' clause in a generator expression, and list comprehension in the 2.7 grammar.
    """

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def IsAsync(self) -> bool:
        """True for `async for`."""

    def GetTargetNode(self) -> CNode | None:
        """The target between `for` and `in`."""

    def GetInNode(self) -> CNode | None:
        """The iterable after `in`."""

    def GetCompIterNode(self) -> CNode | None:
        """The `for` or `if` that follows; None for the last one."""

class CListmakerNode(CNode):
    """Contents of a list display in the 2.7 grammar."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetSubExprCount(self) -> int:
        """The number of items; 1 for a comprehension."""

    def GetSubExpr(self, i: object) -> CExpression | None:
        """
        The item at index `i`; None past the end, and for a comprehension. TypeError when it isn't a CExpression.
        """
    kSupportedRules: list[str] = ...

class CTrailer(CNode):
    """(), [] or .name after an atom."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetDotName(self) -> str | None:
        """The name of `.name`; None for other trailers."""

    def GetNestedNode(self) -> CNode | None:
        """
        The contents of `(...)` or `[...]`; None for empty brackets and for `.name`.
        """

    def GetInitialToken(self) -> str | None:
        """
        The text of the first token. ValueError for a trailer without children.
        """

class CAtom(CExpression):
    """Bracketed atoms and adjacent strings."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetSubExpr(self, i: int) -> CExpression | None:
        """
        The sub-expression at index `i`: None in a plain expression and in a comprehension. ValueError past the end of a comma list, and where an item isn't a CExpression.
        """

    def GetSubExprCount(self) -> int:
        """
        The number of sub-expressions of a comma list: 0 for a plain expression, 1 for a comprehension that is without its brackets.
        """

    def GetInitialBracket(self) -> str | None:
        """
        "(", "[" or "{"; None for other atoms. ValueError for an atom without children.
        """

    def IsLiteral(self) -> bool:
        """True unless the brackets hold a comprehension."""

    def IsComprehension(self) -> bool:
        """True when the brackets hold a comprehension."""

    def IsTwoPlusStringLiterals(self) -> bool:
        """False, for adjacent strings too; kept for hosts that override it."""

class CNameLiteral(CExpression):
    """A name token."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CKeywordLiteral(CExpression):
    """A keyword token."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CNumberLiteral(CExpression):
    """A number token."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def IsFloat(self) -> bool:
        """
        True when the text holds a point or an `e`, be it the digit of a hexadecimal number.
        """

    def GetNumericValue(self) -> object:
        """
        The value of a decimal number; None for other bases, and whatever else the host's int() and float() refuse.
        """

class CStringLiteral(CExpression):
    """A string token."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def IsUnicode(self) -> bool:
        """True with the prefix `u`, a raw marker before it allowed."""

    def IsBytes(self) -> bool:
        """True with the prefix `b`, a raw marker before it allowed."""

    def GetStringContents(self) -> str | None:
        """
        The source between the quotes, escapes as written; up to the end of an unterminated literal.
        """

    def GetStringValue(self) -> object:
        """The value of the literal; None for an f-string."""

class CArgInfo:
    """
    What is known of one argument of a definition or of a call. Good only as long as the tree that its nodes belong to.
    """

    def __init__(self) -> None:
        ...

    @property
    def name(self) -> CNode | None:
        """
        The node of the name: of a parameter, or before `=` in a call; None without one.
        """

    @property
    def value(self) -> CNode | None:
        """
        The node of a parameter's default or of what a call passes; None without one.
        """

    @property
    def prefix(self) -> str | None:
        """"*" or "**"; None without such."""

    @property
    def type_expr(self) -> CNode | None:
        """The node of the annotation; None without one."""

def GetTokenEndIndex(node: CNode) -> int:
    """
    The index of the token after the node's last one; TypeError when that isn't known by an index.
    """

def GetDefiningArgInfoList(node: CNode | None) -> list[CArgInfo]:
    """
    A new list of CArgInfo, one for each parameter of a definition: `node` is its parameter list, with or without brackets, or a lone parameter. A parameter that is a tuple of names (Python 2) is a list of the same kind. AssertionError for a child that isn't a parameter.
    """

def GetUsedArgInfoList(node: CNode | None) -> list[CArgInfo]:
    """
    A new list of CArgInfo, one for each argument of a call: `node` is its argument list, or a lone argument, whose prefix isn't known.
    """

class CAsName:
    """One imported name."""

    def __init__(self) -> None:
        ...

    @property
    def module_name(self) -> str | None:
        """The name as written, with its dots."""

    @module_name.setter
    def module_name(self, arg: str | None, /) -> None:
        ...

    @property
    def as_name(self) -> object:
        """The name after `as`; None without one."""

    @as_name.setter
    def as_name(self, arg: object | None, /) -> None:
        ...

def _GetMatchingChildToken(node: CNode, text: str) -> int:
    """
    The index of the first child of `node` whose text is `text`; -1 when there is none.
    """

def _ProcessAsNamesList(node: CNode | None) -> list[CAsName]:
    """
    A new list of CAsName, one for each name of a list, or the one of `node` itself when that isn't a list.
    """

def _ProcessSingleModuleNameAs(node: CNode | None) -> CAsName | None:
    """The CAsName of `name as name` or of a name."""

def _TextForImportName(node_list: list[CNode]) -> str:
    """
    The texts of all leaves below the nodes, joined with nothing in between.
    """

class CImportNamesStmt(CNode):
    """import a, b."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetAsNameList(self) -> list[CAsName]:
        """A new list of CAsName, one for each imported module."""

class CFromImportStmt(CNode):
    """from a import b."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetFromString(self) -> str | None:
        """
        The module after `from`, with its dots; None when nothing is between `from` and `import`.
        """

    def GetImportStar(self) -> bool:
        """True for `from a import *`."""

    def GetAsNameList(self) -> list[CAsName]:
        """
        A new list of CAsName, one for each imported name; a star is such a name.
        """

    def _GetImportIndex(self) -> int:
        """The index of the child `import`; -1 when there is none."""

class CSingleUsedArgumentNode(CNode):
    """One argument of a call."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetPrefix(self) -> str | None:
        """"*" or "**"; None without such."""

    def GetName(self) -> CNode | None:
        """What is before `=`; None when there is no `=`."""

    def GetValue(self) -> CNode | None:
        """The value after `=`; the node itself when there is no `=`."""

    def IsUnparenthesizedGenExpr(self) -> bool:
        """True for a comprehension without parentheses of its own."""

    def GetNameAssigned(self) -> CNode | None:
        """What is before `:=`; None when there is no `:=`."""

    def GetNamedRightHandExpression(self) -> CNode | None:
        """The value after `:=`; None when there is no `:=`."""

class CFunctionParameterDef(CNode):
    """One parameter definition with a possible annotation."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetNestedListNode(self) -> CNode | None:
        """
        The parameters in parentheses of the old tuple form; None for an ordinary parameter.
        """

    def GetName(self) -> CNode | None:
        """The name; None for the tuple form."""

    def GetTypeExpr(self) -> CNode | None:
        """The annotation; None when there is none."""
    kSupportedRules: list[str] = ...

class CDefiningArglistNode(CNode):
    """Parameter list of a definition."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...
    kSupportedRules: list[str] = ["fplist: fpdef (',' fpdef)* [',']"]

class CUsedArglistNode(CNode):
    """Argument list of a call."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CParametersNode(CNode):
    """( typedargslist )."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CStmt(CNode):
    """Base class for all statements."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CClassdefStmt(CStmt):
    """Class statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetClassName(self) -> str | None:
        """The name after `class`."""

    def GetBaseClassList(self) -> list[CArgInfo]:
        """
        A new list of CArgInfo, one for each base and keyword argument; empty without any.
        """

class CFuncdefStmt(CStmt):
    """def statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetFunctionName(self) -> str | None:
        """The name after `def`."""

    def GetParameters(self) -> CParametersNode | None:
        """The parameters with their parentheses."""

    def GetReturnType(self) -> CExpression | None:
        """The expression after `->`; None when the header has no arrow."""

    def GetSuite(self) -> CNode | None:
        """The body; None for a node without children."""

class CIfStmt(CStmt):
    """If statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetTestExpression(self) -> CExpression | None:
        """The condition of the first branch."""
    kSupportedRules: list[str] = ...

class CMatchStmt(CStmt):
    """Match statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetTestExpression(self) -> CExpression | None:
        """The subject."""

class CCaseStmt(CStmt):
    """Case statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetPattern(self) -> CNode | None:
        """The pattern."""

    def GetGuard(self) -> CNode | None:
        """
        The guard; None with fewer than four children. A case without a guard but with a body has four as well, and answers its `:`.
        """

    def GetBody(self) -> CNode | None:
        """The body on the same logical line; None when there is none."""

class CDelStmt(CStmt):
    """Del statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetExpressions(self) -> list[CNode]:
        """
        A new list of the expressions that are deleted. One in parentheses is a single expression.
        """
    kSupportedRules: list[str] = ["del_stmt: 'del' exprlist"]

class CGlobalStmt(CStmt):
    """Global statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetUtf8NameList(self) -> list[str]:
        """A new list of the names, as text strings."""

class CNonlocalStmt(CStmt):
    """Nonlocal statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetUtf8NameList(self) -> list[str]:
        """A new list of the names, as text strings."""

class CForStmt(CStmt):
    """For statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetTarget(self) -> CNode | None:
        """What is bound in each round."""

    def GetInExpression(self) -> CNode | None:
        """What is iterated over."""

    def GetBody(self) -> CNode | None:
        """The body."""

    def GetElseBody(self) -> CNode | None:
        """The body after `else`; None when there is none."""

class CWithItem(CNode):
    """One item of a with statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetExpression(self) -> CNode | None:
        """The expression before `as`."""

    def GetTarget(self) -> CNode | None:
        """The target after `as`."""

class CWithStmt(CStmt):
    """With statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetWithItems(self) -> list[CWithItem]:
        """
        A new list of the items with `as`; those without one aren't CWithItems.
        """

class CPassStmt(CStmt):
    """Pass statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CAnnotatedAssignNode(CNode):
    """Tail of an annotated assignment."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetTypeHintNode(self) -> CNode | None:
        """The annotation after the colon."""

    def GetPostEqualsTestExpr(self) -> CNode | None:
        """The value after `=`; None for a bare annotation."""
    kSupportedRules: list[str] = ["annassign: ':' test ['=' test]"]

class CExprStmt(CStmt):
    """Expression, assignment and annotated assignment."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetEqualCount(self) -> int:
        """
        The number of `=` of the statement itself; those of arguments, and of an annotated assignment, don't count.
        """

    def GetAnnotatedAssignNode(self) -> CAnnotatedAssignNode | None:
        """The annotation and its value; None when there is no annotation."""

    def GetInitialTestExpr(self) -> CNode | None:
        """The first target, or the expression before an operator."""

    def GetPostEqualsTestExpr(self, equal_num: int) -> CNode | None:
        """
        The target or value after the `=` numbered `equal_num`, from zero; ValueError when there are fewer.
        """

    def GetAugAssignOp(self) -> str | None:
        """
        The operator of an augmented assignment, such as "+="; None when there is none. The operators "|=" and "@=" give None.
        """

class CReturnStmt(CStmt):
    """Return statement."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetValue(self) -> CNode | None:
        """The expression that is returned; None when there is none."""

class CWithTypeParameters(CStmt):
    """
    Pseudo node for type parameterized statements (see PEP 695).

       fChildren is list of CTypeParameter nodes followed by the statement
       being parameterized (assignment, classdef, or funcdef as of Sept 2023)
    """

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetTypeParameters(self) -> list[CNode]:
        """A new list of the CTypeParameter nodes."""

    def GetTypeParameterScopedStatement(self) -> CNode | None:
        """The assignment, class or function that the type parameters belong to."""

class CSingleDecorator(CNode):
    """One decorator."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetDottedName(self) -> CNode | None:
        """The name after `@`: a CDottedName, or a CNameLiteral."""

    def GetUsedArgList(self) -> list[CArgInfo]:
        """A new list of CArgInfo, one for each argument; empty without any."""
    kSupportedRules: list[str] = ...

class CMultipleDecorators(CNode):
    """A decorator list."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...
    kSupportedRules: list[str] = ['decorators: decorator+']

class CExceptClause(CNode):
    """Except clause."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetExceptionType(self) -> CNode | None:
        """The expression after `except`."""

    def GetTarget(self) -> CNode | None:
        """What the exception is bound to; None when it isn't."""
    kSupportedRules: list[str] = ...

class CTypeParameter(CNode):
    """
    Pseudo node used with CWithTypeParameters class -- stores one
       type parameter that is defined. Prefix is None, '*', or '**'.

       fChildren is [prefix] name [: expr]
    """

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

    def GetName(self) -> str | None:
        """The name of the type parameter."""

    def GetPrefix(self) -> str | None:
        """"*" or "**"; None for a plain type parameter."""

    def GetSpecNode(self) -> CNode | None:
        """The bound after the colon; None when there is none."""

class CPatternNode(CNode):
    """Base class for the patterns of a case."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CSequencePatternNode(CPatternNode):
    """[a, b] as a pattern."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CMappingPatternNode(CPatternNode):
    """{'key': a} as a pattern."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CClassArgumentPatternNode(CPatternNode):
    """name=a in a class pattern."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CClassPatternNode(CPatternNode):
    """Name(a, name=b) as a pattern."""

    def __init__(self, cls_info: CNodeClassInfo | None=None) -> None:
        ...

class CNodeFactory:
    """Makes nodes for one grammar, from the free lists of its class records."""

    def __init__(self, gram: object, cls_for_nodetype: object, keywords: object | None, tok_number2name: object, op_text2number: object) -> None:
        ...

    @property
    def _fOperatorStrToNumber(self) -> object:
        """Operator text to token type."""

    @property
    def _fClassInfoList(self) -> list[object]:
        """The class records by node type, as a new list."""

    def ConvertSingleNode(self, type: int, text: object | None, context: object | None, children: object | None) -> CNode | None:
        """
        The node for a token (children None) or a completed rule (a list of at least two nodes). A
        statement followed by its newline is the statement itself.
        """

    def NewNode(self, clsinfo: CNodeClassInfo, type: int, text: object | None, context: object | None, children: object | None) -> CNode | None:
        """
        A node of the record `clsinfo`, from its free list or new; `type` is ignored.
        """

    def NewKeywordNode(self, text: object | None, context: object | None) -> CNode | None:
        """A leaf for a keyword; AttributeError on a factory without keywords."""

    def NewNameNode(self, text: object | None, context: object | None) -> CNode | None:
        """A CNameLiteral leaf."""

    def CreateOperatorNode(self, text: object | None, context: object | None) -> CNode | None:
        """A leaf for an operator; None when `text` isn't one."""

    def DiscardNodes(self, node: object | None) -> None:
        """Give the tree under `node` back to the free lists."""

    def RecursiveConvert(self, raw: tuple[object, ...]) -> CNode | None:
        """Convert a raw tree of (type, text, context, children) tuples."""

def DropSimpleParens(node: CNode) -> CNode:
    """
    If node is a parenthesized expression ( test ), return the
       inner test node.  Otherwise, return the original node.
    """

def IsSetLiteral(atom_node: CAtom) -> bool:
    """True for a set display. ValueError for an atom without children."""

def IsGenExpression(atom_node: CAtom) -> bool:
    """
    True for a generator in its parentheses under a grammar that has its `for` right in them. Where the
    `for` is a node of its own, as in both grammars here, False: ask IsComprehension.
    """

def IsTupleLiteralNode(node: CNode) -> bool:
    """
    True for a tuple, in any number of parentheses or none. AssertionError for parentheses that hold more
    than one node, ValueError for an atom without children.
    """

class CNodeToTextConverter:
    """What turns nodes into short texts; a host may derive its own."""

    def __init__(self) -> None:
        ...

    def TextForNode(self, node: CNode, dotted_name_only: bool=False, discard_simple_parens: bool=True, literal_only: bool=False, add_parens_if_operator: bool=False) -> bytes | None:
        """
        The text of a node as UTF-8; None for what can't be rendered. With `dotted_name_only` a chain ends before its first call or subscript, and what isn't a name or a chain gives None. With `literal_only` a plain name gives None.
        """

class CNodeToTextConverterImpl(CNodeToTextConverter):
    """Turns nodes into short texts, as names are recorded."""

    def __init__(self, include_bracket_text: bool=False, include_string_contents: bool=False, include_arg_text: bool=False) -> None:
        """Whether what is in brackets, in strings and in calls is shown."""

    @property
    def _fIncludeArgText(self) -> bool:
        """True when the arguments of calls are shown."""

    def TextForNode(self, node: CNode, dotted_name_only: bool=False, discard_simple_parens: bool=True, literal_only: bool=False, add_parens_if_operator: bool=False) -> bytes | None:
        """
        The text of a node as UTF-8; None for what can't be rendered. With `dotted_name_only` a chain ends before its first call or subscript, and what isn't a name or a chain gives None. With `literal_only` a plain name gives None.
        """

    def _TextForStringLiteral(self, node: CStringLiteral) -> bytes:
        """
        The text of a string literal as UTF-8: its own where that is wanted and harmless, else a pair of quotes with the mark of its kind.
        """

    def TextForAtomPlusTrailers(self, atom: CNode, trailers: list[CNode], dotted_name_only: bool=False, discard_simple_parens: bool=True, literal_only: bool=False) -> bytes | None:
        """
        The text of an atom and the trailers after it as UTF-8; None when the atom has none. ValueError for a trailer that begins with none of `.`, `(` and `[`.
        """

def FinishedWithNode(node: object | None) -> None:
    """
    Give the tree under `node` back to the free lists. Nobody may hold a node of it afterwards.
    """

def NotCompiledFinishedWithNode(node: CNode) -> None:
    """The same as FinishedWithNode, for hosts."""

def CreateSyntaxError(msg: object | None, logical: object, context: object | None, pos_info_in_tok: object | None=None) -> SyntaxError:
    """
    Create a SyntaxError exception instance for an error occuring at the
       given token index of the logical
    """

class CMatchCaseStatementParser:
    """
    Parses match and case statements by hand, since the grammar files don't know them.
    """

    def __init__(self, pgen_parser: CPGenParserImpl | None) -> None:
        ...

    def _NonNestedFindTokenIndex(self, tok: str, start: int, end: int) -> int:
        """
        The index in [start, end) of the token text `tok` outside brackets; -1 when there is none.
        """

    def _RemoveSkipToks(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> tuple[object, ...]:
        """
        The tokens without comments and line continuations, and their positions: a pair of tuples.
        """

    def ParseMatchStmt(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> CNode | None:
        """
        The CMatchStmt of a logical line, given as tuples of token texts and (row, column) positions; None when it is no `match` statement (PEP 634). ParseError on a bad subject.
        """

    def _ParseMatchStmtImpl(self) -> CNode | None:
        """ParseMatchStmt for the tokens of the line under way."""

    def ParseCaseStmt(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> CNode | None:
        """
        The CCaseStmt of a logical line, given as tuples of token texts and (row, column) positions; None when it is no `case` statement (PEP 634). ParseError on a bad pattern, guard or body.
        """

    def _ParseCaseStmtImpl(self) -> CNode | None:
        """ParseCaseStmt for the tokens of the line under way."""

    def _NodeForPattern(self, start_i: int, end_i: int, allow_as: bool=True) -> CNode | None:
        """
        The node of the pattern in [start_i, end_i). `allow_as`: the range may end in `as name`.
        """

    def _NodeForClassPattern(self, start_i: int, end_i: int) -> CNode | None:
        """The CClassPatternNode of `Name(pattern, name=pattern)`."""

    def _NodeForDottedNameValue(self, start_i: int, end_i: int) -> CNode | None:
        """The CExpression of `name.name`; its text and context are None."""

    def _NodeForNumberPattern(self, start_i: int, end_i: int) -> CNode | None:
        """The CPatternNode of a number with a sign or an imaginary part."""

    def _TokNode(self, tok_i: int) -> CNode | None:
        """A leaf for the token at `tok_i`, with the token's position as context."""

    def _NodeForSequencePattern(self, start_i: int, end_i: int) -> CNode | None:
        """The CSequencePatternNode of a sequence in brackets or parentheses."""

    def _NodeForMappingPattern(self, start_i: int, end_i: int) -> CNode | None:
        """The CSequencePatternNode of a mapping in braces."""

    def _ParseExceptionAt(self, error_i: int) -> Exception:
        """
        A ParseError at the token `error_i`, with the token's position as context; not raised here.
        """

class CPGenParserImpl(CPGenAnalyzer):
    """Analyzes logical using a parser implemented via the pgen2 package"""

    def __init__(self, version_triple: object | None, grammar_file: object='Python-Grammar-3.8', keyword_seq: object | None=None, py3_grammar: bool=True) -> None:
        ...

    @property
    def _fVersionTriple(self) -> object:
        """The Python version analysed, a tuple."""

    @property
    def _fAsyncAlwaysKeyword(self) -> bool:
        """
        True when `async` and `await` are keywords everywhere (3.7 on, PEP 492).
        """

    @property
    def _fMatchCaseStatementParser(self) -> CMatchCaseStatementParser | None:
        """Parses `match` and `case` statements; a CMatchCaseStatementParser."""

    def convert(self, grammar: object | None, type: int, value: object | None, context: object | None, children: object | None) -> object:
        """
        Make the node of a token or of a rule; what it returns is what the rule above gets as a child.

        Called once for each token that the grammar takes, with its type (int), text (str) and context
        (any object) and None as children, and once for each rule that is complete, with the rule's
        number, None as value, the context of its first token and the list of its children. This one
        returns the tuple (type, value, context, children).
        """

    def _BuildClsForStateList(self) -> list[object]:
        """
        The list that gives the node class for each token type and grammar state. Updates kClsForState.
        """

    def DiscardNode(self, node: object | None) -> None:
        """Give a tree back to the free lists. AttributeError for None."""

    def ParseToNode(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool=False) -> CNode | None:
        """
        The node of a logical's statement, or None. ParseError on a token that the grammar
        refuses. Give it back with DiscardNode.
        """

    def ParseToksToNode(self, toks: object, in_async_def: bool, positions: tuple[tuple[int, int], ...] | None) -> CNode | None:
        """ParseToNode for a tuple of tokens and their positions."""

    def _ParseToksToNodeImpl(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None) -> CNode | None:
        """Parse by the grammar alone, without the special cases."""

    def _FindNextNonSkipIndex(self, toks: tuple[object, ...], index: int) -> int:
        """
        The first index beyond `index` whose token is neither removed nor empty, comment or
        backslash; the token count when there is none.
        """

    def _NonNestedFindTokenIndex(self, target: object, toks: tuple[object, ...], start: int, end: int) -> int:
        """
        The index in [start, end) of the token `target` outside brackets; -1 when there is none.
        """

    def _ParseSpecialCases(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None) -> CNode | None:
        """
        The node of a statement that is parsed by hand; None for the ordinary road.
        """

    def _ParseSpecialCaseParenthesizedWith(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        A `with` whose items are in parentheses, with `i` the index of `with`; None when they aren't.
        """

    def _ParseSpecialCaseExceptStar(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        An `except*` clause (PEP 654), with `i` the index of `except`; None for another `except`.
        """

    def _ParseSpecialCaseWithTypeParameter(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        A `type`, `def` or `class` statement with type parameters (PEP 695), with `i` the index of
        its keyword; None for the ordinary road.
        """

    def _NodesForTypeParameters(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, start: int, end: int, raise_errors: bool) -> list[object]:
        """
        The CTypeParameter nodes between the brackets at `start` and `end`. Without `raise_errors`
        malformed parameters are dropped.
        """

    def _CreateSingleTypeParameterNode(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, start: int, end: int, raise_errors: bool) -> CNode | None:
        """The node of the one type parameter in [start, end), or None."""

    def _RaiseParseError(self, tok_i: object) -> None:
        """Raise a ParseError at a token index."""

    def ParseTokenListToNode(self, toks: list[object], in_async_def: bool=False) -> CNode | None:
        """ParseToNode for a list of token texts, without the special cases."""

    def _AddTokenList(self, toks: list[object], tok_i: int) -> None:
        """Feed each token text to the parser, all with the context `tok_i`."""

    def _ShouldSkipSlash(self, tok_i: int, positions: tuple[tuple[int, int], ...] | None) -> bool:
        """
        Utility method to determine if slash (\\) token at tok_i --
               can be relatively slow since slashes are uncommon and is usually called
               after testing token is a slash.
        """

    def GetTypeParameterNodes(self, toks: tuple[object, ...]) -> list[CNode]:
        """
        Get type parameters defined in toks. Tries to ignore parse errors
               and get all names if possible
        """
    kClsForState: dict[str, type[CNode]] = ...

class CNodeWalker:
    """Records what a logical line does with names."""

    def __init__(self, version_triple: tuple[object, ...]) -> None:
        ...

    @property
    def _fIncludeExprText(self) -> bool:
        """
        True when literals of numbers and strings are recorded with their text.
        """

    @_fIncludeExprText.setter
    def _fIncludeExprText(self, arg: bool, /) -> None:
        ...

    @property
    def _fIncludeOperatorExpressions(self) -> bool:
        """False keeps _TypeEquivForOperatorExpression from giving anything."""

    @_fIncludeOperatorExpressions.setter
    def _fIncludeOperatorExpressions(self, arg: bool, /) -> None:
        ...

    @property
    def _fMaxOperatorExpressionLength(self) -> int:
        """Kept for hosts; the limit of 120 bytes doesn't follow it."""

    @_fMaxOperatorExpressionLength.setter
    def _fMaxOperatorExpressionLength(self, arg: int, /) -> None:
        ...

    @property
    def _fPy3(self) -> bool:
        """True when the analysed language level is 3.0 or later."""

    @_fPy3.setter
    def _fPy3(self, arg: bool, /) -> None:
        ...

    @property
    def _fToText(self) -> CNodeToTextConverterImpl:
        """The converter for all text that is recorded."""

    def Walk(self, node: CNode | None, logical: codeloom._neighbours.CLogicalLine) -> None:
        """
        Walk the tree of a logical line and record on the line what it says. A walk of too many visits or too deep ends with a line on the standard output. ValueError while a walk is under way, SyntaxError for what parses but isn't allowed.
        """

    def _ProcessNamesFound(self, node: CNode) -> None:
        """
        Record the names read, then those bound within sub-expressions. `node` is the root; an import reads nothing.
        """

    def _VisitChildren(self, node: CNode) -> None:
        """Visit each direct child, in order."""

    def _RaiseIfNotInstance(self, node: object | None, cls: object) -> None:
        """ValueError unless `node` is an instance of `cls`."""

    def _VisitNode(self, node: CNode) -> None:
        """
        Visit a node: count, limit, dispatch by its class. RuntimeError beyond 10000 visits or a depth of 40.
        """

    def _VisitStoreContextNode(self, node: CNode, within_sub_expr: bool=False) -> None:
        """
        Visit a target. With `within_sub_expr` its names are bound within a sub-expression of the line: a comprehension, a lambda.
        """

    def _VisitLoadContextNode(self, node: CNode) -> None:
        """Visit a value, be it below a target."""

    def _VisitCompForNode(self, node: CCompForNode) -> None:
        """A `for` clause of a comprehension and the clauses after it."""

    def _VisitNameLiteral(self, node: CNameLiteral, atom_node: CNode | None=None, all_trailers: list[CNode] | None=None, trailer_i: int=-1) -> None:
        """
        A name: alone, or of a chain of `atom_node` and `all_trailers`, in the trailer at `trailer_i` or, with -1, as the atom itself.
        """

    def _VisitDottedName(self, node: CDottedName) -> None:
        """Each prefix of `a.b.c` is read: `a`, `a.b`, `a.b.c`."""

    def _ProcessLoadName(self, name: str | None) -> None:
        """Note a name, a text string, as read."""

    def _VisitImportNames(self, node: CImportNamesStmt) -> None:
        """`import a.b` binds `a`, `import a.b as c` binds `c`."""

    def _VisitFromImport(self, node: CFromImportStmt) -> None:
        """`from m import a as b` binds `b`; a star is recorded as the name `*`."""

    def _VisitExprStmt(self, node: CExprStmt) -> None:
        """An assignment of one of the three forms."""

    def _VisitWithItem(self, node: CWithItem) -> None:
        """`a as b` of a `with`."""

    def _VisitFuncdef(self, node: CFuncdefStmt) -> None:
        """The header of a `def`; its body isn't visited."""

    def _VisitLambdaExpr(self, node: CLambdaExpr) -> None:
        """A lambda."""

    def _ProcessLambdaDefiningArgList(self, arg_list: list[CArgInfo]) -> None:
        """
        The arguments of a lambda, a list of CArgInfo: bound within the expression.
        """

    def _VisitGlobalStmt(self, node: CGlobalStmt) -> None:
        """Record each name of `global`."""

    def _VisitNonlocalStmt(self, node: CNonlocalStmt) -> None:
        """Record each name of `nonlocal`."""

    def _VisitParameters(self, node: CParametersNode) -> None:
        """The parameters of a `def`."""

    def _ProcessDefiningArgList(self, arg_list: list[CArgInfo]) -> None:
        """
        Record the arguments of a `def`, a list of CArgInfo and, for the tuple parameters of Python 2, of such lists. AssertionError for any other item.
        """

    def _VisitAssignment(self, node: CExprStmt) -> None:
        """`a = b = c`."""

    def _VisitForStmt(self, node: CForStmt) -> None:
        """A `for` line."""

    def _ProcessTargets(self, lhs: CNode, rhs: CNode | None, extra_trailer: bytes | None=None) -> None:
        """
        Pair the names of a target with what they receive of `rhs`, be it ((a, b), c) = ... or a, *b = ... `extra_trailer`, bytes, tells which part of `rhs` the whole target receives.
        """

    def _VisitAugAssign(self, node: CExprStmt) -> None:
        """`a += b`: both are read, nothing is bound."""

    def _VisitAnnotatedAssign(self, node: CExprStmt) -> None:
        """`a: b = c`; without a value nothing is bound."""

    def _VisitReturn(self, return_stmt: CReturnStmt) -> None:
        """Record the value under the name "return"."""

    def _VisitYield(self, yield_expr: CYieldExpr) -> None:
        """Record the value under the name "yield"."""

    def _VisitPower(self, node: CPower) -> None:
        """A power, and in the 2.7 grammar any chain."""

    def _VisitAtomExpr(self, node: CAtomExpr) -> None:
        """A chain."""

    def _VisitAtomPlusTrailers(self, atom_node: CNode, all_trailers: list[CNode]) -> None:
        """An atom and its trailers, from left to right."""

    def _VisitCall(self, atom: CNode, prev_trailers: list[CNode], arglist: CNode) -> None:
        """The call of what an atom and the trailers after it give."""

    def _ProcessFunctionCall(self, func_name: bytes | None, arg_list: list[CArgInfo]) -> None:
        """
        Visit the arguments of a call, a list of CArgInfo, and record the call of `func_name`, UTF-8 or None. SyntaxError for a bare generator beside another argument.
        """

    def _VisitSingleDecorator(self, node: CSingleDecorator) -> None:
        """A decorator, which is a call also without brackets."""

    def _ProcessIsInstanceCall(self, arg_list: list[CArgInfo]) -> None:
        """Record what `isinstance(a, b)` says of `a`."""

    def _VisitClassdef(self, classdef_node: CClassdefStmt) -> None:
        """The header of a class; its body isn't visited."""

    def _VisitExceptClause(self, exc_clause: CExceptClause) -> None:
        """An `except` line. SyntaxError for a target that isn't a name."""

    def _AppendEquivNode(self, name_node: CNode, equiv_node: CNode | None, extra_trailer: bytes | None=None) -> None:
        """
        Record a name as bound, unless its text holds "[", and what its value stands for.
        """

    def _AppendSubscriptedEquivNode(self, name_node: CNode, equiv_node: CNode | None, subscript: int=-1) -> None:
        """
        Record a name as bound, and as the item `subscript` of a value; -1 is any item.
        """

    def _AddNodeInfoStr(self, name_node: CNode, istr: str | bytes | None) -> None:
        """Record `istr` for the name that a node shows."""

    def _TypeEquivForNode(self, node: CNode, extra_trailer: bytes | None=None) -> bytes | None:
        """
        What a value stands for, as a record; None when that isn't known. `extra_trailer`, bytes, follows it where a part of the value is meant.
        """

    def _TypeEquivForOperatorExpression(self, op_expr: COperatorExpression) -> bytes | None:
        """
        An operator expression with each operand replaced by what it stands for; None when one of them isn't known.
        """

    def _VisitNamedExpr(self, node: CNode) -> None:
        """
        `a := b`, as an expression or as an argument. AssertionError for others.
        """

    def _VisitCaseStmt(self, case_stmt: CCaseStmt) -> None:
        """A `case` line."""

    def _VisitMatchStmt(self, match_stmt: CMatchStmt) -> None:
        """A `match` line."""

    def _VisitPatternNode(self, pattern_node: CPatternNode) -> None:
        """A pattern: captures are bound, values and classes are read."""

    def _VisitTypeParameter(self, type_param: CTypeParameter) -> None:
        """A type parameter (PEP 695)."""

    def _AddNameDefined(self, name: str | bytes) -> None:
        """Record a name, text or UTF-8, as bound."""

    def _AddArgNameDefined(self, name: str | bytes) -> None:
        """Record a name, text or UTF-8, as an argument."""

    def _AddTypeEquiv(self, name: str | bytes, equiv: str | bytes) -> None:
        """Append a record, text or UTF-8, to the line's; without a line nothing."""

    def _AddArgInfoBytes(self, name: str | bytes, ibytes: str | bytes) -> None:
        """Append a record, text or UTF-8, to those of the line's arguments."""

class CDispatchWalker:
    """
    A node walker that uses a dispatch dictionary keyed by node types to determine which visit method to call.
    """

    def __init__(self, dispatch_dict: object | None) -> None:
        ...

    @property
    def _fLogical(self) -> codeloom._neighbours.CLogicalLine | None:
        """The logical being walked; None between walks."""

    @property
    def _fDispatchDict(self) -> object:
        """
        The dispatch dictionary: exact node class to a callable of (walker, node), or to False. A change counts from the next node on.
        """

    @property
    def _fNodeStack(self) -> list[object]:
        """The nodes from the root to the one now visited, as a new list."""

    def Walk(self, node: CNode | None, logical: codeloom._neighbours.CLogicalLine, first_in_def: bool) -> None:
        """
        Walk the tree. This can raise SyntaxError in cases where code parses but is rejected because it's ambiguous. ValueError while a walk is under way.
        """

    def _VisitNode(self, node: CNode | None) -> None:
        """
        Visit the node and all children. Dispatches to a visit method based on node type.
        """

class CTypeHintWalker(CDispatchWalker):
    """
    Records the type hints of a logical line: annotations, and hints in comments.
    """

    def __init__(self, version_triple: object | None, grammar_file: object, general_node_walker: CNodeWalker | None) -> None:
        ...

    @property
    def _fNameConv(self) -> CNodeToTextConverterImpl | None:
        """Gives the name text of a target."""

    @property
    def _fHintConv(self) -> CNodeToTextConverterImpl | None:
        """Gives the text of a hint."""

    @property
    def _fCommentHintCount(self) -> int:
        """
        The comments of the logical being walked that hold "type:"; 0 between walks.
        """

    @property
    def _fHintParser(self) -> CPGenParserImpl | None:
        """The parser for hint text."""

    @property
    def _fGeneralNodeWalker(self) -> CNodeWalker | None:
        """Records the names that hints in comments use."""

    def Walk(self, node: CNode | None, logical: codeloom._neighbours.CLogicalLine, first_in_def: bool) -> None:
        """
        Walk the tree. This can raise SyntaxError in cases where code parses but is rejected because it's ambiguous. ValueError while a walk is under way.
        """

    def _VisitFuncdefStmt(self, node: CFuncdefStmt) -> object:
        """Record the hints of a def's arguments and of what it returns."""

    def _RewriteFuncdefCommentHint(self, hint: str) -> tuple[list[object], list[object]]:
        """
        Rewrite the function hint in a comment so that it parses: the tokens of a `def` with dummy names, and for each the offset to report a syntax error at.
        """

    def _ProcessFuncdefComment(self, hint: str, tok_i: int, funcdef_logical: codeloom._neighbours.CLogicalLine | None, is_arg: bool) -> None:
        """
        Record a hint for a `def`. `funcdef_logical` is None for a comment in the body: then the arguments go by their indexes. TypeError when it has no records of arguments to name them by.
        """

    def _ProcessArgSpecificComment(self, arg: CArgInfo) -> None:
        """
        Record the hint in a comment immediately after an argument and its comma.
        """

    def _VisitForStmt(self, node: CForStmt) -> object:
        """Record the comment hint of a `for` for its target."""

    def _VisitWithStmt(self, node: CWithStmt) -> object:
        """Record the comment hint of a `with` for the target of each item."""

    def _VisitExprStmt(self, node: CExprStmt) -> object:
        """Record the annotation or the comment hint of an assignment."""

    def _ProcessTarget(self, node: CNode, target: CNode | None) -> None:
        """Record the hint in the comment at the end of `node` for `target`."""

    def _ProcessNameAndHintNodes(self, name_node: CNode | None, hint_node: CNode | None, is_arg: bool=False) -> None:
        """
        Record a hint for a name. Tuples are paired item by item; what has no partner is passed over.
        """

    def _FindEndingTypeComment(self, node: CNode) -> tuple[str | None, int]:
        """
        The hint in the comment on the row on which `node` ends, and the index of its token; (None, -1) when there is no comment.
        """

    def _GetHintFromComment(self, comment: str) -> str | None:
        """
        The hint following `type:`, with blanks for all before it, so that offsets stay; None when there is none.
        """

    def _GetRowRange(self, node: CNode) -> tuple[int, int]:
        """The first row of `node` and the one after its last."""

    def _IsDottedName(self, s: bytes) -> bool:
        """
        True for letters and digits alone that begin with a letter, and for nothing.
        """

    def _FindComment(self, row: int, logical: codeloom._neighbours.CLogicalLine | None=None) -> tuple[str | None, int]:
        """
        The comment on a row of `logical`, by default of the one that is walked, and the index of its token; (None, -1) when there is none.
        """

    def _GetHintInfoStr(self, node: CNode | None) -> bytes | None:
        """The record of a hint; None when it has no text."""

    def _AddSymInfo(self, name: object, istr: object, is_arg: bool) -> None:
        """Append a record to the logical."""

    def _ParseHint(self, hint: str, tok_i: int, call_general_node_walker: bool) -> CNode | None:
        """
        The top node of a hint; None when it isn't one expression. Give it back with `_fHintParser.DiscardNode`. SyntaxError with the place in the comment when it doesn't parse.
        """

    def _RaiseHintSyntaxError(self, tok_i: int, utf8_offset_in_hint: int) -> None:
        """
        Raise SyntaxError for a place in the hint that the comment token at `tok_i` holds.
        """

    def _ParseFuncdefCommentHint(self, hint: str, tok_i: int) -> CNode | None:
        """
        The same as _ParseHint for the hint of a function; its names go to no walker.
        """

class CPGenAnalyzerImpl(CPGenAnalyzer):
    """Analyzes logical using a parser implemented via the pgen2 package"""

    def __init__(self, version_triple: object | None, grammar_file: object='Python-Grammar-3.8', keyword_seq: object | None=None, py3_grammar: bool=True, hint_grammar_file: object='Python-Grammar-3.8') -> None:
        ...

    @property
    def _fNodeWalker(self) -> CNodeWalker | None:
        """The walker for names."""

    @property
    def _fTypeHintWalker(self) -> CTypeHintWalker | None:
        """The walker for type hints."""

    def ParseToNode(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool=False) -> CNode | None:
        """
        The node of a logical's statement, or None. ParseError on a token that the grammar refuses.
        """

    def ParseTokenListToNode(self, logical: list[object], in_async_def: bool=False) -> CNode | None:
        """The same for a list of token texts, without the special cases."""

    def GetTypeParameterNodes(self, toks: tuple[object, ...]) -> list[CNode]:
        """
        Get type parameters defined in toks. Tries to ignore parse errors
               and get all names if possible
        """

    def AnalyzeSingleLogical(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool, first_in_def: bool=False) -> SyntaxError | None:
        """
        Analyze a single logical and return any exception (typically
               SyntaxError, but can be other errors). Note that exception is only
               returned if logical has not previously been parsed.
        """

    def _InspectSingleLogical(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool, in_embedded_expression: bool=False, first_in_def: bool=False) -> bool:
        """
        Inspect given logical.  Raises SyntaxError or ValueError on
               unparsable logical
        """

    def _InspectEmbeddedExpressions(self, logical: codeloom._neighbours.CLogicalLine, node: CNode | None, in_async_def: bool, first_in_def: bool) -> None:
        """
        Inspect all embedded expressions.  Will raise exceptions on parse errors
        """

class CExtendedMatchCaseParser(CMatchCaseStatementParser):
    """
    Parses match and case statements, open and empty sequences and adjacent strings included.
    """

    def __init__(self, pgen_parser: CPGenParserImpl | None) -> None:
        ...

    def _RemoveSkipToks(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> tuple[object, ...]:
        """
        The tokens without comments and line continuations, and their positions: a pair of tuples.
        """

    def ParseMatchStmt(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> CNode | None:
        """
        The CMatchStmt of a logical line, given as tuples of token texts and (row, column) positions; None when it is no `match` statement (PEP 634). ParseError on a bad subject.
        """

    def _ParseMatchStmtImpl(self) -> CNode | None:
        """ParseMatchStmt for the tokens of the line under way."""

    def ParseCaseStmt(self, toks: tuple[object, ...], positions: tuple[object, ...]) -> CNode | None:
        """
        The CCaseStmt of a logical line, given as tuples of token texts and (row, column) positions; None when it is no `case` statement (PEP 634). ParseError on a bad pattern, guard or body.
        """

    def _ParseCaseStmtImpl(self) -> CNode | None:
        """ParseCaseStmt for the tokens of the line under way."""

    def _NodeForPattern(self, start_i: int, end_i: int, allow_as: bool=True) -> CNode | None:
        """
        The node of the pattern in [start_i, end_i). `allow_as`: the range may end in `as name`.
        """

class CExtendedParser(CPGenParserImpl):
    """
    Parses the language up to Python 3.14, with the grammar file of that version.
    """

    def __init__(self, version_triple: object | None, grammar_file: object='Python-Grammar-3.14', keyword_seq: object | None=None, py3_grammar: bool=True) -> None:
        ...

    def convert(self, grammar: object | None, type: int, value: object | None, context: object | None, children: object | None) -> object:
        """
        Make the node of a token or of a rule; what it returns is what the rule above gets as a child.

        Called once for each token that the grammar takes, with its type (int), text (str) and context
        (any object) and None as children, and once for each rule that is complete, with the rule's
        number, None as value, the context of its first token and the list of its children. This one
        returns the tuple (type, value, context, children).
        """

    def _BuildClsForStateList(self) -> list[object]:
        """
        The list that gives the node class for each token type and grammar state. Updates kClsForState.
        """

    def ParseToNode(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool=False) -> CNode | None:
        """
        The node of a logical's statement, or None. ParseError on a token that the grammar
        refuses. Give it back with DiscardNode.
        """

    def _ParseToksToNodeImpl(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None) -> CNode | None:
        """Parse by the grammar alone, without the special cases."""

    def _ParseSpecialCases(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None) -> CNode | None:
        """
        The node of a statement that is parsed by hand; None for the ordinary road.
        """

    def _ParseSpecialCaseParenthesizedWith(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        A `with` whose items are in parentheses, with `i` the index of `with`; None when they aren't.
        """

    def _ParseSpecialCaseExceptStar(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        An `except*` clause (PEP 654), with `i` the index of `except`; None for another `except`.
        """

    def _ParseSpecialCaseWithTypeParameter(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, i: int) -> CNode | None:
        """
        A `type`, `def` or `class` statement with type parameters (PEP 695), with `i` the index of
        its keyword; None for the ordinary road.
        """

    def _NodesForTypeParameters(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, start: int, end: int, raise_errors: bool) -> list[object]:
        """
        The CTypeParameter nodes between the brackets at `start` and `end`. Without `raise_errors`
        malformed parameters are dropped.
        """

    def _CreateSingleTypeParameterNode(self, toks: tuple[object, ...], in_async_def: bool, positions: tuple[tuple[int, int], ...] | None, start: int, end: int, raise_errors: bool) -> CNode | None:
        """The node of the one type parameter in [start, end), or None."""

class CExtendedAnalyzer(CPGenAnalyzerImpl):
    """Analyzes logical lines of the language up to Python 3.14."""

    def __init__(self, version_triple: object | None, grammar_file: object='Python-Grammar-3.14', keyword_seq: object | None=None, py3_grammar: bool=True, hint_grammar_file: object='Python-Grammar-3.14') -> None:
        ...

    def AnalyzeSingleLogical(self, logical: codeloom._neighbours.CLogicalLine, in_async_def: bool, first_in_def: bool=False) -> SyntaxError | None:
        """
        Analyze a single logical and return any exception (typically
               SyntaxError, but can be other errors). Note that exception is only
               returned if logical has not previously been parsed.
        """
