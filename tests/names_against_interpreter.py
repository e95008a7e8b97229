"""The occurrences and scopes of whole files against the interpreter's own `ast`, `tokenize` and `symtable`.

    python tests/names_against_interpreter.py [--python2] FOLDER ...

prints each kind of disagreement with its count and first examples. No kind is expected but those in
`KNOWN`, each with its reason. Files of Python 2 are held against the leaves that `lib2to3` finds.
"""

import ast
import io
import keyword
import symtable
import sys
import tokenize
import unicodedata
import warnings
from collections import Counter, defaultdict
from pathlib import Path

from lib2to3_of_host import TokenError, driver, parse, pygram, pytree, token

from codeloom import Role, ScopeKind, analyze

# The version that the interpreter reads.
HOST = "{}.{}".format(*sys.version_info)
KNOWN = {"line with a problem": "a hint in quotes that is no expression"}

CONTEXT_ROLES = {ast.Load: Role.READ, ast.Store: Role.BIND, ast.Del: Role.DELETE}
ATTRIBUTE_ROLES = {
    ast.Load: Role.ATTRIBUTE,
    ast.Store: Role.ATTRIBUTE_BIND,
    ast.Del: Role.ATTRIBUTE_DELETE,
}
AUGMENTED = {Role.BIND: Role.AUGMENT, Role.ATTRIBUTE_BIND: Role.ATTRIBUTE_AUGMENT}
# Roles of what a tree names without a place: whatever isn't a name, an attribute, a parameter or a keyword.


class Expected(ast.NodeVisitor):
    """What a tree says: (role, name) of each, and for most the place of its first character."""

    def __init__(self, rows):
        self.rows = rows
        self.facts = []
        self.in_f_string = False
        self.augmented = None

    def add(self, role, name, row=None, byte=None):
        place = None
        if row is not None and not self.in_f_string:
            place = (row, len(self.rows[row - 1].encode()[:byte].decode()) + 1)
        self.facts.append((role, name, place))

    def add_last(self, role, name, node, written=None):
        """A name that ends where its node does."""
        if node.end_lineno is not None and self.rows[node.end_lineno - 1].isascii():
            self.add(role, name, node.end_lineno, node.end_col_offset - len(written or name))
        else:
            self.add(role, name)

    def visit_JoinedStr(self, node):
        outer, self.in_f_string = self.in_f_string, True
        self.generic_visit(node)
        self.in_f_string = outer

    def visit_Name(self, node):
        role = CONTEXT_ROLES[type(node.ctx)]
        self.add(AUGMENTED[role] if node is self.augmented else role, node.id, node.lineno, node.col_offset)

    def visit_Attribute(self, node):
        role = ATTRIBUTE_ROLES[type(node.ctx)]
        self.add_last(AUGMENTED[role] if node is self.augmented else role, node.attr, node)
        self.generic_visit(node)

    def visit_AugAssign(self, node):
        self.augmented = node.target
        self.generic_visit(node)

    def visit_arg(self, node):
        self.add(Role.PARAMETER, node.arg, node.lineno, node.col_offset)
        self.generic_visit(node)

    def visit_TypeVar(self, node):
        self.add(Role.TYPE_PARAMETER, node.name)
        self.generic_visit(node)

    visit_ParamSpec = visit_TypeVarTuple = visit_TypeVar

    def visit_keyword(self, node):
        if node.arg is not None:
            self.add(Role.KEYWORD, node.arg, node.lineno, node.col_offset)
        self.generic_visit(node)

    def visit_FunctionDef(self, node):
        self.add(Role.BIND, node.name)
        self.generic_visit(node)

    visit_AsyncFunctionDef = visit_ClassDef = visit_FunctionDef

    def visit_Import(self, node):
        for alias in node.names:
            first, *others = alias.name.split(".")
            self.add(Role.ORIGIN if alias.asname else Role.IMPORT, first, alias.lineno, alias.col_offset)
            for other in others:
                self.add(Role.ORIGIN, other)
            self.add_bound(alias)

    def visit_ImportFrom(self, node):
        for part in node.module.split(".") if node.module else []:
            self.add(Role.ORIGIN, part)
        for alias in node.names:
            role = Role.ORIGIN if alias.asname else Role.IMPORT
            self.add(role, alias.name, alias.lineno, alias.col_offset)
            self.add_bound(alias)

    def add_bound(self, alias):
        if alias.asname:
            self.add_last(Role.IMPORT, alias.asname, alias)

    def visit_Global(self, node):
        for name in node.names:
            self.add(Role.GLOBAL, name)

    def visit_Nonlocal(self, node):
        for name in node.names:
            self.add(Role.NONLOCAL, name)

    def visit_ExceptHandler(self, node):
        if node.name:
            self.add(Role.BIND, node.name)
        self.generic_visit(node)

    def visit_MatchAs(self, node):
        if node.name:
            self.add_last(Role.BIND, node.name, node)
        self.generic_visit(node)

    visit_MatchStar = visit_MatchAs

    def visit_MatchMapping(self, node):
        if node.rest:
            self.add(Role.BIND, node.rest)
        self.generic_visit(node)

    def visit_MatchClass(self, node):
        for name in node.kwd_attrs:
            self.add(Role.KEYWORD, name)
        self.generic_visit(node)


def normal(name):
    return name if name.isascii() else unicodedata.normalize("NFKC", name)


def occurrence_disagreements(text, analysis):
    """(kind, what) for each disagreement with `ast` and `tokenize`."""
    rows = io.StringIO(text).read().split("\n")
    expected = Expected(rows)
    expected.visit(ast.parse(text))
    ours, by_place = Counter(), {}
    for occurrence in analysis.occurrences:
        if occurrence.in_quotes or occurrence.in_comment:
            continue
        place = (occurrence.range.row, occurrence.range.column)
        name = normal(occurrence.name)
        shown = rows[place[0] - 1][place[1] - 1 : occurrence.range.end_column - 1]
        if shown != occurrence.name:
            yield "wrong range", f"{place} {occurrence.name} is {shown!r}"
        if place in by_place:
            yield "two at one place", f"{place} {name}"
        by_place[place] = (occurrence.role, name)
        ours[occurrence.role, name] += 1
    theirs = Counter((role, name) for role, name, _ in expected.facts)
    for role, name in theirs - ours:
        yield f"missing {role.name}", name
    for role, name in ours - theirs:
        yield f"unexpected {role.name}", name
    for role, name, place in expected.facts:
        if place is not None and by_place.get(place, (None, None)) != (role, name):
            yield f"misplaced {role.name}", f"{place} {name}: {by_place.get(place)}"
    yield from token_disagreements(text, by_place)


def token_disagreements(text, by_place):
    """Each name among the tokens has an occurrence. Soft keywords may be none.

    `tokenize` takes names with combining characters apart, so only rows of ASCII are looked at.
    """
    before = ""
    for each in tokenize.generate_tokens(io.StringIO(text).readline):
        is_conversion, before = before == "!", each.string  # of a field
        is_name = each.type == tokenize.NAME and each.string not in {*keyword.kwlist, *keyword.softkwlist}
        place = (each.start[0], each.start[1] + 1)
        if is_name and not is_conversion and each.line.isascii() and place not in by_place:
            yield "name without an occurrence", f"{place} {each.string}"


# Scopes

# What `symtable` calls its tables of comprehensions and lambdas, and the kind that each stands for.
SCOPE_KINDS = {
    "listcomp": ScopeKind.LIST_COMPREHENSION,
    "setcomp": ScopeKind.SET_COMPREHENSION,
    "dictcomp": ScopeKind.DICT_COMPREHENSION,
    "genexpr": ScopeKind.GENERATOR,
    "lambda": ScopeKind.LAMBDA,
}
# What 3.12 calls kinds of scopes that later versions call as we do.
SCOPE_WORDS = {"type parameter": "type parameters", "TypeVar bound": "type variable"}
FLAGS = (
    "is_local",
    "is_global",
    "is_free",
    "is_declared_global",
    "is_nonlocal",
    "is_referenced",
    "is_assigned",
    "is_parameter",
    "is_imported",
    "is_annotated",
    "is_namespace",
)


def their_scopes(table):
    """(kind, name, row, symbols, scopes within, names inlined, line) of a table, in a form that compares."""
    word = table.get_type()
    name, kind = table.get_name(), ScopeKind(SCOPE_WORDS.get(word, word))
    if kind is ScopeKind.FUNCTION and name in SCOPE_KINDS and is_nameless(table):
        kind, name = SCOPE_KINDS[name], ""
    if kind is ScopeKind.MODULE:
        name = ""
    row = table.get_lineno() if name else 0
    symbols = {
        symbol.get_name(): tuple(flag for flag in FLAGS if getattr(symbol, flag)())
        for symbol in sorted(table.get_symbols(), key=lambda symbol: symbol.get_name())
        if symbol.get_name() not in IMPLICIT
    }
    children = ordered(map(their_scopes, table.get_children()))
    return kind, name, row, symbols, children, set(), table.get_lineno()


# Names that the interpreter makes up, of comprehensions and around definitions with type parameters.
IMPLICIT = {
    ".0",
    ".defaults",
    ".generic_base",
    ".kwdefaults",
    ".type_params",
    "__classdict__",
    "__type_params__",
}


def is_nameless(table):
    """True for a comprehension or a lambda, not for a function that is called so."""
    return table.get_name() == "lambda" or ".0" in table.get_identifiers()


def ordered(scopes):
    return sorted(scopes, key=lambda scope: (scope[0].value, scope[6], repr(scope[1:4])))


# From 3.12 on these are within the scope around them, and their names among its own (PEP 709).
INLINED = (
    {ScopeKind.LIST_COMPREHENSION, ScopeKind.SET_COMPREHENSION, ScopeKind.DICT_COMPREHENSION}
    if sys.version_info >= (3, 12)
    else set()
)


def our_scopes(analysis):
    """The same of ours, with the names that came from inlined scopes."""
    within = defaultdict(list)
    for scope in analysis.scopes:
        if scope.kind is not ScopeKind.ANNOTATION:
            within[scope.parent].append(scope)

    def shown(scope):
        symbols = {
            normal(symbol.name): tuple(flag for flag in FLAGS if getattr(symbol, flag))
            for symbol in sorted(scope.symbols, key=lambda symbol: normal(symbol.name))
        }
        row = scope.range.row if scope.name else 0
        children, inlined = [], set()
        for child in map(shown, within[scope]):
            if child[0] in INLINED:
                children += child[4]
                inlined |= {*child[3], *child[5]}
            else:
                children.append(child)
        return scope.kind, normal(scope.name), row, symbols, ordered(children), inlined, scope.range.row

    (module,) = within[None]
    return shown(module)


def differences(ours, theirs, where):
    if ours[:2] != theirs[:2] or len(ours[4]) != len(theirs[4]):
        yield "scopes differ", f"{where}: {[s[:3] for s in ours[4]]} {[s[:3] for s in theirs[4]]}"
        return
    if ours[2] != theirs[2]:
        yield "row of a scope differs", f"{where}: {ours[2]} {theirs[2]}"
    for name in {*ours[3], *theirs[3]} - ours[5]:
        mine, flags = ours[3].get(name), theirs[3].get(name)
        if mine is None or flags is None:
            yield f"symbol {'missing' if mine is None else 'unexpected'}", f"{where}.{name} {flags or mine}"
            continue
        for flag in {*mine} ^ {*flags}:
            if flag == "is_namespace" and name.startswith("_") and "__" in name[1:]:
                continue  # the interpreter looks for the scope by the mangled name and finds none
            if flag == "is_namespace" and where.endswith(f".{name}"):
                continue  # the interpreter takes the definition for one among its type parameters
            if flag in ("is_global", "is_local") and where.endswith(".top"):
                continue  # the interpreter takes a function of this name for the module
            yield f"{flag} is {flag in mine}", f"{where}.{name}"
    for mine, other in zip(ours[4], theirs[4], strict=True):
        yield from differences(mine, other, f"{where}.{mine[1] or mine[0].value}")


# Python 2

KEYWORDS2 = {*keyword.kwlist, "print", "exec"} - {"True", "False", "async", "await", "nonlocal"}


def python2_disagreements(text):
    """Each name among the leaves of `lib2to3` has one occurrence, and the other way round."""
    has_print_function = "print_function" in text
    grammar = pygram.python_grammar_no_print_statement if has_print_function else pygram.python_grammar
    tree = driver.Driver(grammar, pytree.convert).parse_string(text.rstrip() + "\n")
    keywords = KEYWORDS2 - {"print"} if has_print_function else KEYWORDS2
    theirs = {
        (leaf.lineno, leaf.column + 1, leaf.value)
        for leaf in tree.leaves()
        if leaf.type == token.NAME and leaf.value not in keywords
    }
    ours = Counter(
        (occurrence.range.row, occurrence.range.column, occurrence.name)
        for occurrence in analyze(text, python="2.7").occurrences
        if not (occurrence.in_comment or occurrence.name == "*")
    )
    for place in theirs - ours.keys():
        yield "name of Python 2 without an occurrence", str(place)
    for place, count in ours.items():
        if place not in theirs or count != 1:
            yield "occurrence of Python 2 without a name", str(place)


def python2_texts_of(folders):
    for folder in folders:
        for path in sorted(Path(folder).rglob("*.py")):
            try:
                text = path.read_text("ascii").replace("\f", " ")
                if "\t" not in text and not analyze(text, python="2.7").problems:
                    list(python2_disagreements(text))
                    yield path, text
            except (UnicodeDecodeError, parse.ParseError, TokenError, IndentationError):
                continue


def texts_of(folders):
    for folder in folders:
        for path in sorted(Path(folder).rglob("*.py")):
            try:
                with tokenize.open(path) as file:
                    text = file.read()
                symtable.symtable(text, str(path), "exec")
            except (SyntaxError, ValueError, UnicodeDecodeError, RecursionError):
                continue
            yield path, text


def disagreements_of(text):
    """(kind, what) for each disagreement over a text; none for one that the interpreter refuses."""
    try:
        table = symtable.symtable(text, "<string>", "exec")
    except SyntaxError:
        return
    analysis = analyze(text, python=HOST)
    if analysis.problems:
        yield "line with a problem", str(analysis.problems[0])
        return
    yield from occurrence_disagreements(text, analysis)
    yield from differences(our_scopes(analysis), their_scopes(table), "module")


def main(arguments):
    warnings.simplefilter("ignore")
    sys.setrecursionlimit(20_000)
    is_python2 = "--python2" in arguments
    folders = [argument for argument in arguments if argument != "--python2"]
    texts = python2_texts_of(folders) if is_python2 else texts_of(folders)
    found, counts = defaultdict(list), Counter()
    for path, text in texts:
        for kind, what in (python2_disagreements if is_python2 else disagreements_of)(text):
            found[kind].append((path, what))
        analysis = analyze(text, python="2.7" if is_python2 else HOST)
        counts["files"] += 1
        counts["occurrences"] += len(analysis.occurrences)
        counts["scopes"] += len(analysis.scopes)
        counts["symbols"] += sum(len(scope.symbols) for scope in analysis.scopes)
    print(*(f"{count:,} {what}" for what, count in counts.items()), sep=", ")
    for kind, examples in sorted(found.items(), key=lambda item: -len(item[1])):
        print(f"{kind}: {len(examples)}", *(f"    {path}: {what}" for path, what in examples[:5]), sep="\n")


if __name__ == "__main__":
    main(sys.argv[1:])
