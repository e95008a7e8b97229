# Made by tools/make_stubs.py; don't edit.
from codeloom._neighbours import BuildLiteralInfo, CKindFilter, EncodeStringLiteral, EnsureScopeNameIndicies, GetInfoBytesKind, GetInstanceNameForClass, IsDefKind, IsDefLineScope, IsParentOfDefLineScope, IsTopLevelModuleScope, JoinTokens, NextNonNestedUtf8PtrIndex, _NonInlineNextNonNestedUtf8PtrIndex, _SymbolConstants
from codeloom._plain_record import CPlainRecord
from codeloom.strutils import AsStr, AsUtf8, BytesForInteger
__all__ = ['BuildArgInfo', 'BuildLiteralInfo', 'CArgTextInfo', 'CDefInfo', 'CFullyScopedName', 'CInfoBytesBuilder', 'CKindFilter', 'CLocationCache', 'CSingleResolvedInfo', 'EncodeStringLiteral', 'EnsureScopeNameIndicies', 'GetInfoBytesKind', 'GetInstanceNameForClass', 'IsDefKind', 'IsDefLineScope', 'IsParentOfDefLineScope', 'IsTopLevelModuleScope', 'JoinTokens', 'NextNonNestedUtf8PtrIndex', 'ObjectForStringLiteral', '_NonInlineNextNonNestedUtf8PtrIndex', 'gInfoBytesBuilder', 'kSetPrefix', 'kSetKind', 'kGetPrefix', 'kGetKind', 'kGlobalPrefix', 'kGlobalKind', 'kNonlocalPrefix', 'kNonlocalKind', 'kWithinExprPrefix', 'kWithinExprKind', 'kImportPrefix', 'kImportKind', 'kFromImportPrefix', 'kFromImportKind', 'kImportAsNamePrefix', 'kImportAsNameKind', 'kCalledPrefix', 'kCalledKind', 'kTypedLiteralPrefix', 'kTypedLiteralKind', 'kExpressionEquivPrefix', 'kExpressionEquivKind', 'kTypeParameterPrefix', 'kTypeParameterKind', 'kTypeHintPrefix', 'kTypeHintKind', 'kSetTypeHintPrefix', 'kSetTypeHintKind', 'kDecoratorPrefix', 'kDecoratorKind', 'kSpecificScopePrefix', 'kSpecificScopeKind', 'kSpecificUrlPrefix', 'kSpecificUrlKind', 'kBuiltinModulePrefix', 'kBuiltinModuleKind', 'kTypingModulePrefix', 'kTypingModuleKind', 'kBuiltinClassPrefix', 'kBuiltinClassKind', 'kArgPrefix', 'kArgKind', 'kMethodPrefix', 'kMethodKind', 'kUnboundMethodPrefix', 'kUnboundMethodKind', 'kFunctionPrefix', 'kFunctionKind', 'kClassPrefix', 'kClassKind', 'kSelfPrefix', 'kSelfKind', 'kInstancePrefix', 'kInstanceKind', 'kModulePrefix', 'kModuleKind', 'kInferredTypeHintPrefix', 'kInferredTypeHintKind', 'kConditionalPrefix', 'kConditionalKind', 'kGenericTypeAliasPrefix', 'kGenericTypeAliasKind', 'kDefLineScopePrefix', 'kDefLineScopeKind', 'kPlainEquivSpec', 'kPlainEquivKind', 'kPrefixLen', 'kIterationSubscript', 'kClassInstanceSuffix', 'kScopeIndexSep', 'kModuleScopeName', 'kWildcardScope', 'kDefLineScopeName', '_kDotLineScopeName', 'kTypingModuleSymbol', 'kTypingModuleSymbolDot', 'kTypingModuleSymbolDotAny', 'kTypingModuleSymbolStr', 'kTypingModuleSymbolDotStr', 'kTypingModuleSymbolDotAnyStr']
gInfoBytesBuilder: CInfoBytesBuilder
kSetPrefix: bytes
kSetKind: int
kGetPrefix: bytes
kGetKind: int
kGlobalPrefix: bytes
kGlobalKind: int
kNonlocalPrefix: bytes
kNonlocalKind: int
kWithinExprPrefix: bytes
kWithinExprKind: int
kImportPrefix: bytes
kImportKind: int
kFromImportPrefix: bytes
kFromImportKind: int
kImportAsNamePrefix: bytes
kImportAsNameKind: int
kCalledPrefix: bytes
kCalledKind: int
kTypedLiteralPrefix: bytes
kTypedLiteralKind: int
kExpressionEquivPrefix: bytes
kExpressionEquivKind: int
kTypeParameterPrefix: bytes
kTypeParameterKind: int
kTypeHintPrefix: bytes
kTypeHintKind: int
kSetTypeHintPrefix: bytes
kSetTypeHintKind: int
kDecoratorPrefix: bytes
kDecoratorKind: int
kSpecificScopePrefix: bytes
kSpecificScopeKind: int
kSpecificUrlPrefix: bytes
kSpecificUrlKind: int
kBuiltinModulePrefix: bytes
kBuiltinModuleKind: int
kTypingModulePrefix: bytes
kTypingModuleKind: int
kBuiltinClassPrefix: bytes
kBuiltinClassKind: int
kArgPrefix: bytes
kArgKind: int
kMethodPrefix: bytes
kMethodKind: int
kUnboundMethodPrefix: bytes
kUnboundMethodKind: int
kFunctionPrefix: bytes
kFunctionKind: int
kClassPrefix: bytes
kClassKind: int
kSelfPrefix: bytes
kSelfKind: int
kInstancePrefix: bytes
kInstanceKind: int
kModulePrefix: bytes
kModuleKind: int
kInferredTypeHintPrefix: bytes
kInferredTypeHintKind: int
kConditionalPrefix: bytes
kConditionalKind: int
kGenericTypeAliasPrefix: bytes
kGenericTypeAliasKind: int
kDefLineScopePrefix: bytes
kDefLineScopeKind: int
kPlainEquivSpec: bytes
kPlainEquivKind: int
kPrefixLen: int
kIterationSubscript: bytes
kClassInstanceSuffix: bytes
kScopeIndexSep: str
kModuleScopeName: str
kWildcardScope: str
kDefLineScopeName: str
_kDotLineScopeName: str
kTypingModuleSymbol: bytes
kTypingModuleSymbolDot: bytes
kTypingModuleSymbolDotAny: bytes
kTypingModuleSymbolStr: str
kTypingModuleSymbolDotStr: str
kTypingModuleSymbolDotAnyStr: str
class CInfoBytesBuilder:
    """Composes records from a prefix and texts."""

    def Build(self, prefix: bytes, *pieces: bytes | str | None) -> bytes:
        """The prefix and the pieces, joined as UTF-8; None contributes nothing."""
        ...
def BuildArgInfo(i: int, name: bytes | str | None) -> bytes:
    """The record that stands for an argument by its index from zero, with its name if known."""
    ...
def ObjectForStringLiteral(text: bytes | str) -> str | bytes | None:
    """The value of a string literal, as the interpreter evaluates it; nothing is executed.

    None for what isn't exactly one string literal, for one that the interpreter refuses, and for
    an f-string, whose value isn't in its text. TypeError for what isn't text.
    """
    ...
class CFullyScopedName(CPlainRecord):
    """The name of a definition: the module, the scope in it, and the name in that scope."""
    module_name: str
    scope: str
    name: str

    def __init__(self, module_name: str, scope: str, name: str) -> None:
        ...
class CDefInfo(CPlainRecord):
    """A definition: its name, its kind, and the row from zero that it is on."""
    name: CFullyScopedName
    kind: int
    first_line: int

    def __init__(self, name: CFullyScopedName, kind: int, first_line: int) -> None:
        ...
class CArgTextInfo(CPlainRecord):
    """The texts of one argument: prefix, name, hint and default, each None when there is none."""
    prefix: str | None
    name: str | None
    type_text: str | None
    value_text: str | None

    def __init__(self, prefix: str | None, name: str | None, type_text: str | None, value_text: str | None) -> None:
        ...
class CSingleResolvedInfo(CPlainRecord):
    """What one record was found to mean: the record, and the location that it leads to."""
    ibytes: bytes
    loc: object

    def __init__(self, ibytes: bytes, loc: object) -> None:
        ...
class CLocationCache:
    """Locations that are looked up once. A location is shared: equal ones are the same object."""

    def __init__(self) -> None:
        ...

    def _InitBuiltinLoc(self) -> None:
        """Set the location of the builtins. A host's cache puts its own here."""
        ...

    def GetBuiltinLoc(self) -> object:
        """The location of the builtins."""
        ...
