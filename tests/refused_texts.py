"""Texts that the interpreter refuses: collected from its own test suite, with its row and its message.

`compile`, `exec` and `eval` are watched while the suite's syntax tests run, doctests included, and the
bad files beside it are read. A text counts when the interpreter refuses it as a whole file.

    python tests/refused_texts.py            one JSON object a row
"""

import ast
import builtins
import io
import json
import sys
import textwrap
import unittest
import warnings
from collections.abc import Callable, Iterator
from contextlib import redirect_stderr, redirect_stdout
from dataclasses import asdict, dataclass
from pathlib import Path
from types import CodeType

# Test modules of the interpreter that hand it texts to be refused. What a version lacks is passed over.
# fmt: off
MODULES = (
    "test_syntax", "test_exceptions", "test_grammar", "test_fstring", "test_tstring", "test_patma",
    "test_named_expressions", "test_generators", "test_genexps", "test_coroutines", "test_asyncgen",
    "test_scope", "test_unpack_ex", "test_positional_only_arg", "test_keywordonlyarg",
    "test_future_stmt.test_future", "test_future", "test_global", "test_string_literals",
    "test_type_comments", "test_eof", "test_compile", "test_except_star", "test_pep646_syntax",
    "test_augassign", "test_decorators", "test_with", "test_dictcomps", "test_setcomps",
    "test_listcomps", "test_ast", "test_ast.test_ast", "test_unicode_identifiers",
    "test_source_encoding", "test_type_params", "test_type_aliases", "test_type_annotations",
    "test_flufl", "test_lambda", "test_extcall", "test_utf8source", "test_parser",
)
# fmt: on


@dataclass(frozen=True)
class Refused:
    """A text, the row that the interpreter blames (None where it names none), and its words."""

    text: str
    row: int | None
    message: str


def Collect() -> list[Refused]:
    """The refused texts of this interpreter's test suite, each once, in the order met."""
    seen: dict[str, Refused] = {}
    for text in (*_TextsOfTests(), *_BadFiles()):
        if text in seen:
            continue
        refused = Judge(text)
        if refused is not None:
            seen[text] = refused
    return list(seen.values())


def Judge(text: str) -> Refused | None:
    """What this interpreter says of a text as a whole file; None when it takes it."""
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            compile(text, "<text>", "exec", dont_inherit=True)
    except SyntaxError as error:
        return Refused(text, error.lineno, error.msg or "")
    except (ValueError, RecursionError, MemoryError, OverflowError, UnicodeError):
        return None
    return None


def _TextsOfTests() -> list[str]:
    texts: list[str] = []
    with _Watched(texts.append), redirect_stdout(io.StringIO()), redirect_stderr(io.StringIO()):
        for module in MODULES:
            _RunTests(f"test.{module}")
    return texts


def _RunTests(module: str) -> None:
    try:
        suite = unittest.defaultTestLoader.loadTestsFromName(module)
        unittest.TextTestRunner(stream=io.StringIO(), verbosity=0).run(suite)
    except BaseException as error:  # a module that this version lacks, or that ends the run
        if isinstance(error, KeyboardInterrupt):
            raise


class _Watched:
    """Hands every text that is compiled to `note`, dedented too where it is a block."""

    def __init__(self, note: Callable[[str], None]) -> None:
        self._fNote = note
        self._fBuiltins = builtins.compile, builtins.exec, builtins.eval

    def __enter__(self) -> None:
        plain_compile, plain_exec, plain_eval = self._fBuiltins

        def Compile(source, *args, **kwargs):  # type: ignore[no-untyped-def]
            self._Note(source)
            return plain_compile(source, *args, **kwargs)

        def Run(run):  # type: ignore[no-untyped-def]
            def Hooked(source, global_names=None, local_names=None, /, **kwargs):  # type: ignore[no-untyped-def]
                self._Note(source)
                frame = sys._getframe(1)
                if global_names is None:
                    global_names = frame.f_globals
                    if local_names is None:
                        local_names = frame.f_locals
                return run(source, global_names, local_names, **kwargs)

            return Hooked

        builtins.compile, builtins.exec, builtins.eval = Compile, Run(plain_exec), Run(plain_eval)

    def __exit__(self, *_: object) -> None:
        builtins.compile, builtins.exec, builtins.eval = self._fBuiltins

    def _Note(self, source: object) -> None:
        if isinstance(source, CodeType | ast.AST):
            return
        if isinstance(source, bytes | bytearray):
            try:
                source = bytes(source).decode("utf-8-sig")
            except UnicodeDecodeError:
                return
        if isinstance(source, str) and self._IsMeant(source):
            self._fNote(source)
            if textwrap.dedent(source) != source:
                self._fNote(textwrap.dedent(source))

    @staticmethod
    def _IsMeant(source: str) -> bool:
        """A byte order mark is refused in a text, but not in a file that begins with it."""
        return "\0" not in source and source[:1] != "\ufeff" and len(source) < 20_000


def _BadFiles() -> Iterator[str]:
    import test

    for folder in map(Path, test.__path__):
        for path in sorted(folder.rglob("bad*.py")):
            try:
                yield path.read_text("utf-8")
            except (UnicodeDecodeError, OSError):
                continue


if __name__ == "__main__":
    for refused in Collect():
        print(json.dumps(asdict(refused)))
