#include "extended/extended_parser.h"

#include "extended/extended_match_case_parser.h"
#include "extended/outside_brackets.h"
#include "host/errors.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/class_table.h"
#include "parse/parentheses.h"
#include "parse/pseudo_node.h"
#include "parse/token_search.h"
#include "text/token_type.h"
#include "tree/child_list.h"
#include "tree/statement_nodes.h"

namespace codeloom {

namespace {

// What is in the parentheses after a `with`.
struct CWithContents {
    bool has_target = false;  // `a as b`, which no expression has
    bool are_items = false;   // without a target, expressions with commas between them
};

CWithContents ReadWithContents(const nb::tuple& toks, Py_ssize_t open_i, Py_ssize_t close_i) {
    CWithContents contents;
    bool is_item_start = true, is_expression = false;
    ForEachOutsideBrackets(toks, open_i + 1, close_i, [&](Py_ssize_t, std::string_view text) {
        contents.are_items = true;
        contents.has_target |= text == "as";
        is_expression |= text == "yield" || text == ":=" || text == "for" || (is_item_start && text == "*");
        is_item_start = text == ",";
        return !contents.has_target;
    });
    contents.are_items &= contents.has_target || !is_expression;
    return contents;
}

}  // namespace

void CExtendedParser::Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
                           bool py3_grammar) {
    CPGenParserImpl::Init(std::move(version_triple), std::move(grammar_file), std::move(keyword_seq),
                          py3_grammar);
    const CRef<CExtendedMatchCaseParser> match_case_parser = NewInstance<CExtendedMatchCaseParser>(Self());
    _fMatchCaseStatementParser = CRef<CMatchCaseStatementParser>(match_case_parser.get());
    _fForms.SetVersion(_fVersionTriple);
    _fForms.WatchStates(
        [this](const char* state) { return _HasSymbol(state) ? _NumberOfSymbol(state) : -1; });
}

nb::object CExtendedParser::convert(nb::handle grammar, int type, nb::handle value, nb::handle context,
                                    nb::handle children) {
    return _Noted(type, CPGenParserImpl::convert(grammar, type, value, context, children));
}

nb::object CExtendedParser::ConvertRule(nb::handle grammar, int type, nb::handle context, CObjectStack& stack,
                                        size_t first) {
    return _Noted(type, CPGenParserImpl::ConvertRule(grammar, type, context, stack, first));
}

nb::object CExtendedParser::_Noted(int type, nb::object node) {
    if (_fForms.AreWatched(type)) _fForms.NoteNode(type, *Instance<CNode>(node));
    return node;
}

CNodeRef CExtendedParser::ParseToNode(CLogicalLine& logical, bool in_async_def) {
    _fForms.Reset();
    CNodeRef node = CPGenParserImpl::ParseToNode(logical, in_async_def);
    if (!_fForms.HasFound()) return node;
    const nb::object error = _fForms.ErrorIn(logical);  // before host code may parse another line
    if (node) DiscardNode(node.AsHost());
    RaiseHostError(error);
}

// A star before any expression has a rule of its own in the grammar, since `star_expr` takes less. And `...`
// is an expression, so that what holds one loses no records.
nb::list CExtendedParser::_WithNewerClasses(nb::list classes) const {
    if (_HasSymbol("star_test")) classes[_NumberOfSymbol("star_test")] = nb::type<CStarExpression>();
    classes[static_cast<int>(kTokenId_ELLIPSIS)] = nb::type<CExpression>();
    return classes;
}

nb::list CExtendedParser::_BuildClsForStateList() {
    return _WithNewerClasses(CPGenParserImpl::_BuildClsForStateList());
}

bool CExtendedParser::HasOriginalClasses() const {
    const nb::list original = _WithNewerClasses(OriginalClsForStateList(_fGrammar));
    if (!nb::isinstance<nb::list>(_fClsForStateList) || ListSize(_fClsForStateList) != ListSize(original))
        return false;
    for (Py_ssize_t i = 0; i < ListSize(original); ++i)
        if (!ListItem(_fClsForStateList, i).is(ListItem(original, i))) return false;
    return true;
}

CNodeRef CExtendedParser::_ParseSpecialCases(nb::tuple toks, bool in_async_def, CPositions positions) {
    const Py_ssize_t i = _FindNextNonSkipIndex(toks, -1);
    if (i >= TupleSize(toks)) return CNodeRef();
    const CUtf8 text(TupleItem(toks, i));
    if (text == "@") return _ParseDecorator(toks, in_async_def, positions, i);
    if (text == "match" || text == "case") return _ParseMatchOrCase(toks, in_async_def, positions, i);
    if (text == "async") {
        const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, i);
        if (IsToken(toks, next_i, "with"))
            return _ParseSpecialCaseParenthesizedWith(toks, in_async_def, positions, next_i);
    }
    return CPGenParserImpl::_ParseSpecialCases(std::move(toks), in_async_def, std::move(positions));
}

CNodeRef CExtendedParser::_ParseMatchOrCase(const nb::tuple& toks, bool in_async_def,
                                            const CPositions& positions, Py_ssize_t word_i) {
    CNodeRef node = _ParseMatchCaseOrName(toks, in_async_def, positions, word_i);
    if (node && node->As<CMatchStmt>()) _fForms.Note(forms::kMatch, nb::int_(word_i));
    if (node && node->As<CCaseStmt>()) _fForms.Note(forms::kCase, nb::int_(word_i));
    return node;
}

// `case[x + 1]: int` looks like a case whose pattern is bad. It may be the annotation of a name, and before
// 3.10 it is always a name.
CNodeRef CExtendedParser::_ParseMatchCaseOrName(const nb::tuple& toks, bool in_async_def,
                                                const CPositions& positions, Py_ssize_t word_i) {
    const bool may_be_name = IsToken(toks, _FindNextNonSkipIndex(toks, word_i), "[");
    if (may_be_name && _fForms.IsNewer(forms::kCase)) {
        try {
            return _ParseToksToNodeImpl(toks, in_async_def, positions);
        } catch (const nb::python_error& error) {
            if (!IsParseError(error)) throw;
        }
    }
    try {
        return CPGenParserImpl::_ParseSpecialCases(toks, in_async_def, positions);
    } catch (const nb::python_error& error) {
        if (!IsParseError(error) || !may_be_name) throw;
        try {
            return _ParseToksToNodeImpl(toks, in_async_def, positions);
        } catch (const nb::python_error& second_error) {
            if (!IsParseError(second_error)) throw;
        }
        throw;
    }
}

//   with (open(a) as f, open(b)):    items
//   with (a), (b):   with (a)[0]:    with (x := f()) as y:    with (yield):    none
CNodeRef CExtendedParser::_ParseSpecialCaseParenthesizedWith(nb::tuple toks, bool in_async_def,
                                                             CPositions positions, Py_ssize_t i) {
    _RefuseLastComma(toks, i);
    const Py_ssize_t open_i = _FindNextNonSkipIndex(toks, i);
    if (!IsToken(toks, open_i, "(")) return CNodeRef();
    const Py_ssize_t close_i = _NonNestedFindTokenIndex(nb::str(")"), toks, open_i + 1, TupleSize(toks));
    if (close_i == -1 || !IsToken(toks, _FindNextNonSkipIndex(toks, close_i), ":")) return CNodeRef();
    const CWithContents contents = ReadWithContents(toks, open_i, close_i);
    if (!contents.are_items) return CNodeRef();
    if (contents.has_target) _fForms.Note(forms::kWithBrackets, nb::int_(open_i));
    return CPGenParserImpl::_ParseSpecialCaseParenthesizedWith(std::move(toks), in_async_def,
                                                               std::move(positions), i);
}

//   with a, b,:
//             ^    is within brackets only, which are off when the grammar reads the items
void CExtendedParser::_RefuseLastComma(const nb::tuple& toks, Py_ssize_t with_i) {
    bool is_after_comma = false;
    ForEachOutsideBrackets(toks, with_i + 1, TupleSize(toks), [&](Py_ssize_t i, std::string_view text) {
        if (is_after_comma && text == ":") _RaiseParseError(nb::int_(i));
        is_after_comma = text == ",";
        return text != ":";
    });
}

//   except A, B:         may lack its brackets (PEP 758)
//   except A, B as e:    may not, which the grammar doesn't know
CNodeRef CExtendedParser::_ParseSpecialCaseExceptStar(nb::tuple toks, bool in_async_def, CPositions positions,
                                                      Py_ssize_t i) {
    Py_ssize_t comma_i = -1, as_i = -1;
    ForEachOutsideBrackets(toks, i + 1, TupleSize(toks), [&](Py_ssize_t tok_i, std::string_view text) {
        if (comma_i == -1 && text == ",") comma_i = tok_i;
        if (text == "as") as_i = tok_i;
        return as_i == -1 && text != ":";
    });
    if (comma_i != -1 && as_i != -1) _RaiseParseError(nb::int_(comma_i));
    CNodeRef node = CPGenParserImpl::_ParseSpecialCaseExceptStar(toks, in_async_def, positions, i);
    if (node) _fForms.Note(forms::kExceptStar, nb::int_(_FindNextNonSkipIndex(toks, i)));
    return node;
}

//   @a.b(c)    the grammar's
//   @a[0].b    parsed as `(a[0].b)`
//   a CSingleDecorator: `@`, the expression, the end of the row
CNodeRef CExtendedParser::_ParseDecorator(const nb::tuple& toks, bool in_async_def,
                                          const CPositions& positions, Py_ssize_t at_i) {
    if (_FitsDecoratorRule(toks, at_i)) return CNodeRef();
    const Py_ssize_t count = TupleSize(toks);
    if (_FindNextNonSkipIndex(toks, at_i) == count) _RaiseParseError(nb::int_(count));
    const Py_ssize_t close_i = _NonNestedFindTokenIndex(nb::str(")"), toks, at_i + 1, count);
    if (close_i != -1) _RaiseParseError(nb::int_(close_i));
    CNodeRef expression =
        WithoutParentheses(_ParseToksToNodeImpl(InParentheses(toks, at_i, count), in_async_def, positions));
    _RequireSingle(*expression);
    _fForms.Note(forms::kDecorator, nb::int_(_FindNextNonSkipIndex(toks, at_i)));
    nb::list children;
    const nb::int_ end(count);
    children.append(_fNodeFactory->CreateOperatorNode(nb::str("@"), nb::int_(at_i)).Release());
    children.append(expression.Release());
    children.append(
        _fNodeFactory->ConvertSingleNode(kTokenId_NEWLINE, nb::str("\n"), end, nb::none()).Release());
    return _fNodeFactory->ConvertSingleNode(_NumberOfSymbol("decorator"), nb::none(), nb::int_(at_i),
                                            children);
}

// `@name.name`, perhaps called: the form that the grammar has a tree for.
bool CExtendedParser::_FitsDecoratorRule(const nb::tuple& toks, Py_ssize_t at_i) {
    Py_ssize_t i = at_i;
    do {
        i = _FindNextNonSkipIndex(toks, i);
        if (!_IsPlainName(toks, i)) return false;
        i = _FindNextNonSkipIndex(toks, i);
    } while (IsToken(toks, i, "."));
    if (IsToken(toks, i, "(")) {
        i = _NonNestedFindTokenIndex(nb::str(")"), toks, i + 1, TupleSize(toks));
        if (i == -1) return true;  // the grammar finds what is wrong
        i = _FindNextNonSkipIndex(toks, i);
    }
    return i >= TupleSize(toks);
}

//   def f[]():    an empty list isn't allowed
nb::list CExtendedParser::_NodesForTypeParameters(nb::tuple toks, bool in_async_def, CPositions positions,
                                                  Py_ssize_t start, Py_ssize_t end, bool raise_errors) {
    if (raise_errors && _FindNextNonSkipIndex(toks, start) >= end) _RaiseParseError(nb::int_(end));
    return CPGenParserImpl::_NodesForTypeParameters(toks, in_async_def, positions, start, end, raise_errors);
}

//   T = int        name '=' default
//   T: a = b       name ':' node, a CNode of the bound, '=' and the default
CNodeRef CExtendedParser::_CreateSingleTypeParameterNode(nb::tuple toks, bool in_async_def,
                                                         CPositions positions, Py_ssize_t start,
                                                         Py_ssize_t end, bool raise_errors) {
    const Py_ssize_t equal_i = _NonNestedFindTokenIndex(nb::str("="), toks, start, end);
    if (equal_i == -1)
        return CPGenParserImpl::_CreateSingleTypeParameterNode(toks, in_async_def, positions, start, end,
                                                               raise_errors);
    CNodeRef parameter = CPGenParserImpl::_CreateSingleTypeParameterNode(toks, in_async_def, positions, start,
                                                                         equal_i, raise_errors);
    if (!parameter && raise_errors) _RaiseParseError(nb::int_(start));
    if (!parameter) return parameter;
    _fForms.Note(forms::kTypeDefault, nb::int_(equal_i));
    CNodeRef value = _ParseDefault(toks, in_async_def, positions, equal_i, end, raise_errors);
    if (!value) return parameter;
    CNodeRef equal = _fNodeFactory->CreateOperatorNode(nb::str("="), nb::int_(equal_i));
    if (ListedCount(*parameter) > 2 && parameter->IsToken(-2, ":")) {
        const CNodeRef bound = parameter->fChildren.Remove(-1);
        parameter->fChildren.Append(NewPseudoNode<CNode>({bound, equal, value}));
    } else {
        parameter->fChildren.Append(std::move(equal));
        parameter->fChildren.Append(std::move(value));
    }
    return parameter;
}

// The default after the `=` at `equal_i`; none when it is refused and errors aren't raised.
CNodeRef CExtendedParser::_ParseDefault(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                                        Py_ssize_t equal_i, Py_ssize_t end, bool raise_errors) {
    const bool is_missing = _FindNextNonSkipIndex(toks, equal_i) >= end;
    if (is_missing && raise_errors) _RaiseParseError(nb::int_(end));
    if (is_missing) return CNodeRef();
    CNodeRef value = _ParseBound(toks, in_async_def, positions, equal_i, end, raise_errors);
    const bool is_unpacking = value && value->As<CStarExpression>();
    if (raise_errors && !is_unpacking) _RequireSingle(*value);
    return value;
}

// A ParseError at what makes more of a node than one expression: a comma, a comprehension, `=`, `yield`, `*`.
void CExtendedParser::_RequireSingle(const CNode& node) {
    if (node.As<CTestListStarExpr>() || !node.As<CExpression>()) _RaiseParseError(node.ChildAt(1).fContext);
    if (node.As<CStarExpression>() || node.As<CYieldExpr>() || node.HasText("yield"))
        _RaiseParseError(node.fContext);
}

// A name that isn't a keyword.
bool CExtendedParser::_IsPlainName(const nb::tuple& toks, Py_ssize_t i) const {
    return i < TupleSize(toks) && IsName(toks, i) && !IsKeyword(TupleItem(toks, i));
}

void BindExtendedParser(nb::module_& module) {
    BindExtendedMatchCaseParser(module);
    nb::class_<CExtendedParser, CPGenParserImpl, THostSubclass<CExtendedParser>> binding(
        module, "CExtendedParser", Collected<CExtendedParser>(),
        "Parses the language up to Python 3.14, with the grammar file of that version.");
    binding.def(TInit<nb::object, nb::object, nb::object, bool>(), "version_triple"_a.none(),
                "grammar_file"_a = kNewerGrammar, "keyword_seq"_a = nb::none(), "py3_grammar"_a = true);
    BindOperations(binding);
}

}  // namespace codeloom
