# Made by tools/make_stubs.py; don't edit.
from collections.abc import Iterable, Sized
kTokenId_ENDMARKER: int = 0
kTokenId_NAME: int = 1
kTokenId_NUMBER: int = 2
kTokenId_STRING: int = 3
kTokenId_NEWLINE: int = 4
kTokenId_INDENT: int = 5
kTokenId_DEDENT: int = 6
kTokenId_LPAR: int = 7
kTokenId_RPAR: int = 8
kTokenId_LSQB: int = 9
kTokenId_RSQB: int = 10
kTokenId_COLON: int = 11
kTokenId_COMMA: int = 12
kTokenId_SEMI: int = 13
kTokenId_PLUS: int = 14
kTokenId_MINUS: int = 15
kTokenId_STAR: int = 16
kTokenId_SLASH: int = 17
kTokenId_VBAR: int = 18
kTokenId_AMPER: int = 19
kTokenId_LESS: int = 20
kTokenId_GREATER: int = 21
kTokenId_EQUAL: int = 22
kTokenId_DOT: int = 23
kTokenId_PERCENT: int = 24
kTokenId_BACKQUOTE: int = 25
kTokenId_LBRACE: int = 26
kTokenId_RBRACE: int = 27
kTokenId_EQEQUAL: int = 28
kTokenId_NOTEQUAL: int = 29
kTokenId_LESSEQUAL: int = 30
kTokenId_GREATEREQUAL: int = 31
kTokenId_TILDE: int = 32
kTokenId_CIRCUMFLEX: int = 33
kTokenId_LEFTSHIFT: int = 34
kTokenId_RIGHTSHIFT: int = 35
kTokenId_DOUBLESTAR: int = 36
kTokenId_PLUSEQUAL: int = 37
kTokenId_MINEQUAL: int = 38
kTokenId_STAREQUAL: int = 39
kTokenId_SLASHEQUAL: int = 40
kTokenId_PERCENTEQUAL: int = 41
kTokenId_AMPEREQUAL: int = 42
kTokenId_VBAREQUAL: int = 43
kTokenId_CIRCUMFLEXEQUAL: int = 44
kTokenId_LEFTSHIFTEQUAL: int = 45
kTokenId_RIGHTSHIFTEQUAL: int = 46
kTokenId_DOUBLESTAREQUAL: int = 47
kTokenId_DOUBLESLASH: int = 48
kTokenId_DOUBLESLASHEQUAL: int = 49
kTokenId_AT: int = 50
kTokenId_ATEQUAL: int = 51
kTokenId_RARROW: int = 51
kTokenId_ELLIPSIS: int = 52
kTokenId_COLONEQUAL: int = 53
kTokenId_ERRORTOKEN: int = 54
kTokenId_AWAIT: int = 55
kTokenId_ASYNC: int = 56
kTokenId_COMMENT: int = 202
kTokenId_BACKSLASH: int = 203

def GetTokenType(token: object, unused: object | None=None) -> int:
    """
    The token type, an integer, of a token text (text or byte string): 1 for a name, 54 for what is no token.
    """

def FindMatchOrCaseType(toks: tuple[object, ...], first: int, end: int) -> str:
    """
    The logical type of the tokens from `first` up to `end`: kMatch or kCase when they form
    the header of such a statement (PEP 634), kUnknown when the word is a name.
    """
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

class CLogicalLine:
    """
    One logical line of Python source.

    CLogicalLine(type, toks, positions, first_line=0, exp_logicals=(), tok_types=None)
    makes one by hand: a logical type (text string), a tuple of token texts (None for a removed token),
    a tuple of (row, column) pairs with rows from zero from the logical's first row and columns in UTF-8
    bytes, the source row of the first token, the embedded logicals, and the token types, which are
    computed when not given. Unequal lengths raise ValueError, wrong types TypeError.
    utils.GetLogicalsFromText makes them from source text.
    """

    def __init__(self, type: object, toks: tuple[object, ...], positions: tuple[object, ...], first_line: int=0, exp_logicals: tuple[object, ...]=(), tok_types: object | None=None) -> None:
        ...

    @property
    def fType(self) -> str:
        """The logical type, one of the constants of logicalline."""

    @property
    def fToks(self) -> tuple[str, ...]:
        """Tuple of token texts; None for a removed token."""

    @property
    def fTokTypes(self) -> tuple[int, ...]:
        """Tuple of token types, one for each token."""

    @property
    def fPositions(self) -> tuple[tuple[int, int], ...]:
        """
        Tuple of (row, column): row from zero from the first row, column in UTF-8 bytes from zero.
        """

    @property
    def fParsed(self) -> bool:
        """True once the logical has been analyzed."""

    @property
    def fFirstLine(self) -> int:
        """Source row of the first token, from zero."""

    @property
    def fTokenCount(self) -> int:
        """Number of tokens."""

    @property
    def fTypeEquivs(self) -> list[tuple[bytes, bytes]] | None:
        """
        List of (name, equiv) pairs of byte strings in order of arrival; None when there is none.
        """

    @property
    def fArgTypeEquivs(self) -> list[tuple[bytes, bytes]] | None:
        """The same for the arguments of a definition."""

    @property
    def fOrigin(self) -> tuple[int, int]:
        """
        Where position (0, 0) is in the file, as (row, column in UTF-8 bytes), both from zero. Columns of row 0 count from it, columns of later rows from the start of the file's row.
        """

    @property
    def fInAsyncDef(self) -> bool:
        """True in the header and the body of an `async def`."""

    @property
    def fFirstInDef(self) -> bool:
        """True for the first line of a def's body."""

    def GetTokenType(self, i: int) -> int:
        """The token type, an integer, of the token at index `i`."""

    def AppendTypeEquiv(self, name: object, equiv: object) -> None:
        """Append the pair (name, equiv) of UTF-8 byte strings to `fTypeEquivs`."""

    def AppendArgTypeEquiv(self, name: object, equiv: object) -> None:
        """
        Append the pair (name, equiv) of UTF-8 byte strings to `fArgTypeEquivs`.
        """

    def MarkParsed(self, parsed: bool) -> None:
        """Set or clear `fParsed`; a logical that is marked isn't analyzed again."""

    def ClearDerivedInfo(self) -> None:
        """
        Drop all that analysis has recorded on this logical and on its embedded logicals.
        """

    def GetExpLogicals(self) -> tuple[CLogicalLine, ...]:
        """The embedded logicals, a tuple in source order."""

def GetLogicalsFromText(text: str) -> list[CLogicalLine]:
    """
    The logical lines of a source text, a list of CLogicalLine. It never fails on what the text says:
    what isn't Python becomes tokens that the parser refuses, on the line where it is.
    """

class ParseError(Exception):
    """
    A text isn't what the grammar allows.

        ParseError(msg, type, value, context): what is wrong (str), and the type (int), the text (str) and the
        context of the token that was refused, as they were fed; all four are attributes. Type and value are None
        where it wasn't a token that was refused.
    """

    def __init__(self, msg: object, type: object, value: object, context: object):
        ...

    def __str__(self) -> str:
        ...

class Grammar:
    """
    The rules of a grammar, as tables that a parser runs on. ParserGenerator.make_grammar makes it.
    """

    @property
    def symbol2number(self) -> dict[str, int]:
        """
        Rule names to rule numbers: 256 for the start symbol, then the other names in order.
        """

    @property
    def number2symbol(self) -> dict[int, str]:
        """Rule numbers to rule names."""

    def __repr__(self) -> str:
        ...

class ParserGenerator:
    """
    Reads a grammar file.

    ParserGenerator(grammar_file, tok_number2name, op_text2number): the path of a grammar text in pgen
    notation, a dict from token type (int) to its name (str), and one from operator text (str) to token
    type. The first rule is the start symbol. Raises OSError when the file can't be read, and ValueError
    with file, row and reason when it isn't a grammar.
    """

    def __init__(self, grammar_file: object, tok_number2name: dict[object, object], op_text2number: dict[object, object]) -> None:
        ...

    def make_grammar(self) -> Grammar | None:
        """
        The Grammar that the file defines.

        Raises ValueError with file, row and reason on an unknown name or operator, a rule that is defined
        twice, can be empty or begins with itself, and a choice that the next token alone doesn't decide.
        """

class NodeConverter:
    """Makes the nodes of a parse; derive from it to make your own."""

    def __init__(self) -> None:
        ...

    def convert(self, grammar: object | None, type: int, value: object | None, context: object | None, children: object | None) -> object:
        """
        Make the node of a token or of a rule; what it returns is what the rule above gets as a child.

        Called once for each token that the grammar takes, with its type (int), text (str) and context
        (any object) and None as children, and once for each rule that is complete, with the rule's
        number, None as value, the context of its first token and the list of its children. This one
        returns the tuple (type, value, context, children).
        """

class Parser:
    """What takes the tokens of a text one by one. CreateParser makes one."""

    def __init__(self) -> None:
        ...

    def setup(self, start: object | None=None) -> None:
        """
        Begin a new parse, whatever became of the last one.

        `start` (int) is the number of the rule to parse; None stands for the grammar's start symbol.
        Raises ValueError when no rule has that number.
        """

    def addtoken(self, type: int, value: object | None, context: object | None) -> bool:
        """
        Feed one token; True when the start symbol is complete.

        `type` (int) is the token type, `value` (str or None) the token's text and `context` any object:
        it goes into the nodes, and into the ParseError that is raised on a token which the grammar
        refuses. Raises RuntimeError when no parse is going on.
        """

    def finish(self) -> object:
        """
        The root of the parse, which is handed over: the parser keeps nothing of it.

        Raises ParseError when the start symbol isn't complete, RuntimeError when no parse is going on.
        """

class ParserImpl(Parser):
    """
    The parser that runs on a grammar's tables.

    ParserImpl(grammar, node_converter=None, promotesinglechild=True): a NodeConverter makes the nodes;
    None stands for one that gives tuples (type, value, context, children). With promotesinglechild a
    rule that has a single child is replaced by that child. Each parse is setup, addtoken for each
    token, finish; after an exception the next setup begins anew. The operations can't be called from
    within one another.
    """

    def __init__(self, grammar: Grammar, node_converter: NodeConverter | None=None, promotesinglechild: bool=True) -> None:
        ...

    def setup(self, start: object | None=None) -> None:
        """
        Begin a new parse, whatever became of the last one.

        `start` (int) is the number of the rule to parse; None stands for the grammar's start symbol.
        Raises ValueError when no rule has that number.
        """

    def addtoken(self, type: int, value: object | None, context: object | None) -> bool:
        """
        Feed one token; True when the start symbol is complete.

        `type` (int) is the token type, `value` (str or None) the token's text and `context` any object:
        it goes into the nodes, and into the ParseError that is raised on a token which the grammar
        refuses. Raises RuntimeError when no parse is going on.
        """

    def finish(self) -> object:
        """
        The root of the parse, which is handed over: the parser keeps nothing of it.

        Raises ParseError when the start symbol isn't complete, RuntimeError when no parse is going on.
        """

def CreateParser(grammar: Grammar, node_converter: NodeConverter | None=None, promotesinglechild: bool=True) -> Parser | None:
    """
    A Parser for a grammar, whose nodes `node_converter` makes. See ParserImpl.
    """

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

def AsUtf8(text: bytes | str) -> bytes:
    """
    The UTF-8 bytes of a text string, lone surrogates in three bytes; a byte string as it is.
    TypeError for anything else.
    """

def AsStr(text: bytes | str) -> str:
    """
    The text string for UTF-8 bytes, lone surrogates included; a text string as it is.
    UnicodeDecodeError for malformed bytes, TypeError for anything else.
    """

def BytesForInteger(value: int) -> bytes:
    """
    The decimal digits of an integer of 64 bits, a minus sign before them if negative.
    """

def Utf8Concat5(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None, s3: bytes | str | None, s4: bytes | str | None) -> bytes:
    """The five joined as UTF-8; None contributes nothing."""

def Utf8Len(text: bytes | str) -> int:
    """
    Of a UTF-8 byte string the number of its characters, each byte but a continuation byte counting
    as one; of a text string the number of its UTF-8 bytes.
    """

def IsUtf8LeadByte(byte: int | bytes | str) -> bool:
    """
    True for every byte that starts a character: all but the continuation bytes.
    """

def _NonInlineUcs4CharAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> str:
    """
    The character that begins at byte `pos`, a text string of one: U+FFFD where no well-formed
    character begins. IndexError or ValueError when `pos` or `end_pos` lies outside the buffer.
    """

class CNonNestedSearch:
    """
    A search for bytes that lie outside brackets and string literals of Python source.

    InitWith sets it up, FindNext gives one hit after the other.
    """

    def __init__(self) -> None:
        ...

    def InitWith(self, to_search: object, to_find_bytes: bytes, start: int, end: int) -> int:
        """
        Search the UTF-8 bytes start..end of a byte or text string for `to_find_bytes`. Anything
        else, None included, leaves the search idle. Returns 0. TypeError for a subclass of either
        or when `to_find_bytes` isn't a byte string, AssertionError when `start` or `end` lies outside
        the text.
        """

    def FindNext(self) -> int:
        """
        The byte offset of the next hit, -1 when there is none; the search is idle then.
        """

    def Clear(self) -> None:
        """Make the search idle and let go of the text."""

def _FindStringEndNonNested(search: CNonNestedSearch, quote_i: int) -> int:
    """
    The byte index after the string literal whose opening quote is at `quote_i` of the text
    searched. An unterminated one ends with its row, with triple quotes at the end of the search.
    IndexError when `quote_i` lies outside the text searched.
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

class CStringTokenizer:
    """
    The tokens of a piece of Python text, one after the other.

    CStringTokenizer(utf8) is on the first token of a byte or text string; comments and blanks, row
    ends among them, aren't tokens.
    """

    def __init__(self, utf8: bytes | str) -> None:
        ...

    @property
    def fAtEnd(self) -> bool:
        """True after the last token."""

    @property
    def fPos(self) -> int:
        """
        The byte offset of the current token; the length of the text at the end.
        """

    @property
    def fNestCount(self) -> int:
        """
        The number of brackets open around the current token, which isn't counted itself.
        """

    def GetToken(self) -> str:
        """The text of the current token; empty at the end."""

    def Next(self) -> None:
        """Move to the next token; at the end, nothing happens."""

def _RecordKinds() -> tuple[tuple[str, bytes, int, str, str, str, str, str], ...]:
    """
    The kinds of records: name, prefix, kind, word, form of the payload, meaning, a line of source
    and the record that it yields.
    """

def _SymbolConstants() -> dict[str, object]:
    """The constants of the vocabulary by name."""

class CKindFilter:
    """A set of kinds: CKindFilter(kinds), a byte string of them."""

    def __init__(self, kinds: bytes=...) -> None:
        ...

    def KindMatches(self, kind: int | bytes | str) -> bool:
        """True when the kind is in the set."""

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

def BuildLiteralInfo(type_name: bytes | str, text: bytes | str | None) -> bytes:
    """
    The record of a literal of this type with this text; None when the text isn't known.
    """

def EncodeStringLiteral(text: bytes | str) -> bytes:
    """
    The text of a string literal with its prefix and quotes on one row: what ends rows is
    written as an escape, and a continued row is joined. The value is the same, but for raw
    strings.
    """

def JoinTokens(tokens: Iterable[bytes | str]) -> bytes:
    """
    Tokens, or texts of expressions, joined with blanks as a formatter would.
    """

def _NonInlineNextNonNestedUtf8PtrIndex(utf8_ptr: bytes | str, pos: int, end_pos: int) -> int:
    """
    The byte index after the bracket or string that begins at `pos`; `end_pos` when it doesn't end.
    IndexError or ValueError when `pos` or `end_pos` lies outside the buffer.
    """

def EnsureScopeNameIndicies(scope: bytes | str) -> str:
    """A scope with an index after every name: "A#1.f" gives "A#1.f#0"."""

def GetInstanceNameForClass(cls_name: bytes | str) -> str:
    """
    The name that stands for an instance of a class: "list" gives "list:". The index of a first
    definition, "#0", is left out.
    """
