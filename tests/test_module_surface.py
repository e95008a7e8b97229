"""What the host sees of the engine, the order in which it loads, and how it fails to."""

import ast
import inspect
import sys
from pathlib import Path

import pytest
from run_python import RunInSubinterpreter, RunPython
from tools_of_project import tool_named

from codeloom import _fastaccess, _neighbours, logicalline, strutils, symbolinfo, treesift

ROOT = Path(__file__).parent.parent


STANDARD_MODULES = {"keyword", "re", "sys", "token", "os", "time", "pgen"}
VOCABULARY = [*symbolinfo._SymbolConstants(), "gInfoBytesBuilder", "CKindFilter"]
LOGICAL_TYPES = [name for name in logicalline.__all__ if name.startswith("k")]


def Visible() -> dict[str, object]:
    return {name: value for name, value in vars(treesift).items() if not name.startswith("__")}


# What is there


@pytest.mark.parametrize(
    ("neighbour", "names"),
    [
        (symbolinfo, VOCABULARY),
        (logicalline, [*LOGICAL_TYPES, "CLogicalLine"]),
        (strutils, ["AsUtf8", "TextPosInfo", "_CTextPosInfo"]),
        (_fastaccess, ["CLogger", "CNonNestedSearch", "CStringTokenizer", "GetTokenType"]),
    ],
    ids=lambda value: getattr(value, "__name__", ""),
)
def test_imported_names_are_the_neighbours(neighbour, names):
    for name in names:
        assert getattr(treesift, name) is getattr(neighbour, name)


CONSTANTS = """
    kPy2DefaultGrammar kPy3DefaultGrammar kLiteralPrefix kListInstanceName kDictInstanceName
    kSetInstanceName kTupleInstanceName kStringInstanceName kUnicodeInstanceName kBytesInstanceName
    kIntLiteralName kFloatLiteralName
"""


def test_constants_are_set_in_their_order():
    names = CONSTANTS.split()
    assert [name for name in Visible() if name in names] == names
    prefix, suffix = symbolinfo.kTypedLiteralPrefix, symbolinfo.kClassInstanceSuffix
    classes = b"list dict set tuple str unicode bytes int float".split()
    values = [getattr(treesift, name) for name in names]
    assert values[:3] == ["Python-Grammar-2.7", "Python-Grammar-3.8", prefix]
    assert values[3:] == [prefix + cls + suffix for cls in classes]
    assert values[3:] == [treesift._GetBuiltinInstanceName(cls.decode()) for cls in classes]


def test_class_attributes_are_made_while_loading():
    classes = treesift.CPGenParserImpl.kClsForState
    assert classes["funcdef"] is treesift.CFuncdefStmt
    assert all(isinstance(cls.kSupportedRules, list) for cls in classes.values())
    assert treesift.CStarExpression.kSupportedRules != treesift.CFuncdefStmt.kSupportedRules
    for cls in (treesift.CPGenParserImpl, treesift.CPGenAnalyzerImpl):
        assert "Python-Grammar-3.8" in cls.__init__.__doc__


def test_everything_that_can_be_called_is_documented():
    for module in (treesift, _neighbours):
        routines = [value for value in vars(module).values() if inspect.isroutine(value)]
        assert [value.__name__ for value in routines if not value.__doc__] == []
        native = [value for value in routines if not inspect.isfunction(value)]
        assert [value.__name__ for value in native if "\n" not in value.__doc__] == []
    wanted = (
        " Create a SyntaxError exception instance for an error occuring at the\n"
        "    given token index of the logical "
    )
    assert treesift.CreateSyntaxError.__doc__.endswith(wanted)


# Loading

LACKING = [
    ("codeloom.optpgen", "NodeConverter"),
    ("bytebuffer", "CEncodedByteBufferReader"),
    ("codeloom.strutils", "_CTextPosInfo"),
    ("codeloom._fastaccess", "CStringTokenizer"),
    ("codeloom.logicalline", "kErrorTokenPrefix"),
    ("codeloom.logicalinspect", "TextFromTokens"),
    ("codeloom.utils", "GetLogicalsFromText"),
    ("codeloom.symbolinfo", "kNonlocalPrefix"),
    ("tarnbase.destroyable", "CDestroyable"),
    ("tarnutils.reflect", "RaiseWithTraceback"),
    ("config", "GetTarnFilename"),
]


@pytest.mark.parametrize(("module_name", "name"), LACKING, ids=lambda value: value)
def test_a_neighbour_that_lacks_a_name_stops_the_load(module_name, name):
    standin = module_name if module_name.startswith("codeloom.") else f"codeloom._standins.{module_name}"
    code = f"""
import importlib, sys
del importlib.import_module({standin!r}).{name}
try:
    import codeloom.treesift
except ImportError as error:
    print(error)
print("codeloom.treesift" in sys.modules, "config" in sys.modules)
"""
    assert RunPython(code) == f"cannot import name '{name}' from '{module_name}'\nFalse False\n"


def test_a_neighbour_that_is_missing_stops_the_load():
    code = """
import sys
sys.modules["codeloom.utils"] = None
try:
    import codeloom.treesift
except ImportError as error:
    print(type(error).__name__, error.name)
"""
    assert RunPython(code) == "ModuleNotFoundError codeloom.utils\n"


def test_a_failing_constant_stops_the_load():
    code = """
import codeloom.symbolinfo
def EnsureScopeNameIndicies(scope):
    raise LookupError(scope)
codeloom.symbolinfo.EnsureScopeNameIndicies = EnsureScopeNameIndicies
try:
    import codeloom.treesift
except LookupError as error:
    print(error)
"""
    assert RunPython(code) == "list\n"


@pytest.mark.parametrize(
    ("name", "value", "wanted"),
    [
        ("kSetPrefix", "b':x:'", "b':s:'"),
        ("kIterationSubscript", "b'[]'", "b'[*]'"),
        ("kPrefixLen", "4", "3"),
        ("JoinTokens", "b' '.join", "that of codeloom._neighbours"),
    ],
)
def test_another_vocabulary_is_refused(name, value, wanted):
    code = f"""
import codeloom.symbolinfo
codeloom.symbolinfo.{name} = {value}
try:
    import codeloom.treesift
except ImportError as error:
    print(error)
"""
    assert RunPython(code).endswith(f"another vocabulary: codeloom.symbolinfo.{name} must be {wanted}\n")


def test_loading_leaves_no_traces():
    code = """
import sys
path = list(sys.path)
import codeloom.treesift
print([name for name in ("config", "bytebuffer", "tarnutils", "tarnbase") if name in sys.modules])
print(sys.path == path)
"""
    assert RunPython(code) == "[]\nTrue\n"


def test_pgen_is_imported_when_somebody_looks():
    code = """
import sys, codeloom.treesift as treesift
analyzer = treesift.CPGenAnalyzerImpl((3, 8, 0))
print("pgen" in dir(treesift), any("pgen2.pgen" in name for name in sys.modules))
print(treesift.pgen.grammar.opmap["<>"], treesift.pgen is vars(treesift)["pgen"])
try:
    treesift.pgenn
except AttributeError as error:
    print(error)
"""
    no_attribute = "module 'codeloom.treesift' has no attribute 'pgenn'"
    assert RunPython(code) == f"True False\n29 True\n{no_attribute}\n"


def test_operators_are_those_of_a_pgen_that_was_looked_at():
    code = """
import codeloom.treesift as treesift
treesift.pgen.grammar.opmap = {}
try:
    treesift.CPGenParserImpl((3, 8, 0))
except Exception as error:
    print(type(error).__name__)
"""
    assert RunPython(code) == "ValueError\n"


def test_our_operators_are_those_of_the_interpreter():
    from lib2to3_of_host import pgen

    from codeloom._standins import pgen as standin

    assert standin.grammar.opmap == pgen.grammar.opmap


# Stubs


def test_no_object_changes_its_class():
    modules = (treesift, _neighbours)
    classes = {cls for module in modules for cls in vars(module).values() if isinstance(cls, type)}
    native = [cls for cls in classes if cls.__module__ in {module.__name__ for module in modules}]
    assert len(native) > 70
    for cls in native:
        if not issubclass(cls, BaseException):
            with pytest.raises(AttributeError, match="__class__"):
                cls.__new__(cls).__class__ = cls


@pytest.mark.parametrize("name", ["treesift", "_neighbours", "_analysis"])
@pytest.mark.parametrize("configuration", ["isolated", "legacy"])
@pytest.mark.parametrize("before", ["", "import codeloom.treesift, codeloom._neighbours, codeloom._analysis"])
def test_a_subinterpreter_is_refused(name, configuration, before):
    code = f"try: import codeloom.{name}\nexcept ImportError as error: print(error, flush=True)"
    printed = RunInSubinterpreter(code, before, configuration)
    assert printed.startswith("codeloom.") and "can't be loaded in a subinterpreter: use it in" in printed


def test_a_free_threaded_python_is_refused():
    code = "import sys\nsys.abiflags = 't'\ntry: import codeloom\nexcept ImportError as error: print(error)"
    assert "free-threaded Python: use a usual build of CPython 3.11" in RunPython(code)


@pytest.mark.skipif(sys.version_info >= (3, 12), reason="they are made with 3.11")
def test_the_stubs_are_up_to_date():
    pytest.importorskip("nanobind")
    tool = tool_named("make_stubs")
    for file_name, text in tool.all_stubs().items():
        written = (ROOT / "codeloom" / file_name).read_text(encoding="utf-8")
        assert ast.dump(ast.parse(written)) == ast.dump(ast.parse(text)), (
            f"{file_name} is out of date; run: python tools/make_stubs.py"
        )


def test_the_stubs_name_exactly_what_is_visible():
    named = set()
    for statement in ast.parse((ROOT / "codeloom/treesift.pyi").read_text(encoding="utf-8")).body:
        if isinstance(statement, ast.Import | ast.ImportFrom):
            named |= {alias.asname for alias in statement.names}
        else:
            named.add(getattr(statement, "name", None) or statement.target.id)
    assert named - {None} == set(Visible()) - STANDARD_MODULES
