#include "parse/parser_driver.h"

#include <algorithm>

#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/text.h"
#include "parse/class_table.h"
#include "parse/token_feed.h"
#include "parse/token_search.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kGetTarnFilename("config", "GetTarnFilename");
constexpr CNeighbourFunction kParserGenerator("optpgen", "ParserGenerator");
constexpr CNeighbourFunction kCreateParser("optpgen", "CreateParser");
constexpr CNeighbourFunction kParseError("optpgen", "ParseError");

// The names of the token types, from the constants of the token classifier.
nb::dict TokenNames() {
    constexpr std::string_view kNamePrefix = "kTokenId_";
    nb::dict names;
    const nb::dict constants = nb::borrow<nb::dict>(HomeModule().attr("_fastaccess").attr("__dict__"));
    for (auto [name, value] : constants) {
        const CUtf8 text(name);
        if (text->starts_with(kNamePrefix) && nb::isinstance<nb::int_>(value))
            names[value] = TextFromUtf8(text->substr(kNamePrefix.size()));
    }
    return names;
}

// Operator texts to token types: the interpreter's table and three operators that it lacks.
nb::object OperatorTypes() {
    const nb::module_ loading = nb::module_::import_("codeloom._loading");
    nb::object types = loading.attr("OperatorTypes")(HomeModule()).attr("copy")();
    types["..."] = static_cast<int>(kTokenId_ELLIPSIS);
    types["->"] = static_cast<int>(kTokenId_RARROW);
    types[":="] = static_cast<int>(kTokenId_COLONEQUAL);
    return types;
}

nb::dict KeywordsOf(nb::object keyword_seq) {
    if (keyword_seq.is_none()) keyword_seq = HomeModule().attr("keyword").attr("kwlist");
    nb::dict keywords;
    for (nb::handle keyword : keyword_seq) keywords[InternedText(CUtf8(keyword))] = nb::none();
    return keywords;
}

}  // namespace

nb::object PathOfGrammar(nb::object grammar_file) {
    if (IsTrue(nb::object(HomeModule().attr("os").attr("path").attr("isabs")(grammar_file))))
        return grammar_file;
    return kGetTarnFilename(nb::str("resources/pgen-grammars/") + grammar_file);
}

void CPGenParserImpl::Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
                           bool py3_grammar) {
    const nb::dict token_names = TokenNames();
    const nb::object operator_types = OperatorTypes();
    const nb::object generator = kParserGenerator(
        PathOfGrammar(grammar_file), "tok_number2name"_a = token_names, "op_text2number"_a = operator_types);
    _fGrammar = generator.attr("make_grammar")();
    _fPy3Grammar = py3_grammar;
    if (!version_triple.is_none() && !nb::isinstance<nb::tuple>(version_triple))
        RaiseWrongType("tuple", version_triple);
    _fVersionTriple = std::move(version_triple);
    _fAsyncAlwaysKeyword = _fVersionTriple >= nb::make_tuple(3, 7);
    _fKeywords = KeywordsOf(std::move(keyword_seq));
    _fParser = CRef<Parser>(
        Instance<Parser>(nb::object(kCreateParser(_fGrammar, Self(), "promotesinglechild"_a = true))));
    _fFileInputNumber = _NumberOfSymbol("file_input");
    _fClsForStateList = _BuildClsForStateList();
    _fNodeFactory = MakeInstance<CNodeFactory>();
    _fNodeFactory->Init(_fGrammar, _fClsForStateList, _fKeywords, token_names, operator_types);
    _fMatchCaseStatementParser = NewInstance<CMatchCaseStatementParser>(Self());
    __GetTime = HomeModule().attr("time").attr("time");
}

bool CPGenParserImpl::_HasSymbol(const char* symbol) const {
    return DictContains(nb::dict(_fGrammar.attr("symbol2number")), nb::str(symbol));
}

int CPGenParserImpl::_NumberOfSymbol(const char* symbol) const {
    return ResultFromHost<int32_t>(nb::object(_fGrammar.attr("symbol2number")[symbol]));
}

nb::object CPGenParserImpl::convert(nb::handle, int type, nb::handle value, nb::handle context,
                                    nb::handle children) {
    if (children.is_none()) return _fNodeFactory->ConvertToken(type, value, context).Release();
    return _fNodeFactory->ConvertSingleNode(type, value, context, children).Release();
}

nb::object CPGenParserImpl::ConvertRule(nb::handle, int type, nb::handle context, CObjectStack& stack,
                                        size_t first) {
    return _fNodeFactory->ConvertRule(type, context, stack, first).Release();
}

void CPGenParserImpl::DiscardNode(nb::handle node) {
    _fNodeFactory->DiscardNodes(node);
}

CNodeRef CPGenParserImpl::ParseToNode(CLogicalLine& logical, bool in_async_def) {
    return ParseToksToNode(logical.GetToks(), in_async_def, CPositions(logical));
}

CNodeRef CPGenParserImpl::ParseToksToNode(nb::object toks, bool in_async_def, CPositions positions) {
    nb::tuple tok_tuple(toks);
    CNodeRef node = _ParseSpecialCases(tok_tuple, in_async_def, positions);
    if (node) return node;
    return _ParseToksToNodeImpl(std::move(tok_tuple), in_async_def, std::move(positions));
}

CNodeRef CPGenParserImpl::ParseTokenListToNode(nb::list toks, bool in_async_def) {
    return _ParseToksToNodeImpl(nb::tuple(toks), in_async_def, CPositions());
}

CNodeRef CPGenParserImpl::_ParseToksToNodeImpl(nb::tuple toks, bool in_async_def, CPositions positions) {
    return _ParseByGrammar(toks, in_async_def, positions, 0, TupleSize(toks));
}

CNodeRef CPGenParserImpl::_ParseByGrammar(const nb::tuple& toks, bool in_async_def,
                                          const CPositions& positions, Py_ssize_t start, Py_ssize_t end) {
    if (end == 0) return CNodeRef();
    CTokenFeed feed(*this, toks, in_async_def, positions, start, end);
    feed.FeedAll();
    return _PeelRoot(_fParser->finish(), feed.IsDecorator());
}

// The root holds the statement and the end marker; a decorated statement holds the decorator and an invented
// function.
CNodeRef CPGenParserImpl::_PeelRoot(nb::object parsed, bool is_decorator) {
    const bool is_raw = parsed.type().is(reinterpret_cast<PyObject*>(&PyTuple_Type));
    CNodeRef root = is_raw ? _fNodeFactory->RecursiveConvert(nb::borrow<nb::tuple>(parsed))
                           : CNodeRef(Instance<CNode>(parsed));
    parsed.reset();
    const auto take_first_child = [this](CNodeRef& parent) {
        CNodeRef first = parent->fChildren.Remove(0);
        _fNodeFactory->DiscardNodes(parent->Self());
        return first;
    };
    const CNodeRef last = root->_GetChildCount() == 2 ? root->GetChild(1) : CNodeRef();
    if (!last || !last->fClsInfo || last->fClsInfo->fNodeType != kTokenId_ENDMARKER) {
        _fNodeFactory->DiscardNodes(root->Self());
        return CNodeRef();
    }
    CNodeRef statement = take_first_child(root);
    if (is_decorator && statement->_GetChildCount() == 2) return take_first_child(statement);
    return statement;
}

Py_ssize_t CPGenParserImpl::_FindNextNonSkipIndex(nb::tuple toks, Py_ssize_t index) {
    const Py_ssize_t count = TupleSize(toks);
    for (index = std::min(index, count) + 1; index < count; ++index) {
        const nb::handle tok = TupleItem(toks, index);
        if (tok.is_none()) continue;
        if (!IsPassedOver(CUtf8(tok))) break;
    }
    return index < count ? index : count;
}

Py_ssize_t CPGenParserImpl::_NonNestedFindTokenIndex(nb::object target, nb::tuple toks, Py_ssize_t start,
                                                     Py_ssize_t end) {
    return FindOutsideBrackets(CUtf8(target), toks, start, end);
}

void CPGenParserImpl::_RaiseParseError(nb::handle tok_i) {
    RaiseHostError(kParseError("syntax error", nb::none(), nb::none(), tok_i));
}

void CPGenParserImpl::_AddTokenList(nb::list toks, Py_ssize_t tok_i) {
    const nb::int_ context(tok_i);
    for (Py_ssize_t i = 0; i < ListSize(toks); ++i) {
        const nb::object tok = nb::borrow(ListItem(toks, i));
        _fParser->addtoken(GetTokenType(CUtf8(tok)), tok, context);
    }
}

bool CPGenParserImpl::_ShouldSkipSlash(Py_ssize_t tok_i, CPositions positions) {
    if (positions.IsNone()) return true;
    const nb::object entries = positions.AsHost();
    const Py_ssize_t count = static_cast<Py_ssize_t>(nb::len(entries));
    if (tok_i >= count) return false;
    if (tok_i + 1 == count) return true;
    const nb::object row = entries[tok_i][0], next_row = entries[tok_i + 1][0];
    return next_row > row;
}

void BindParserDriver(nb::module_& module) {
    BindMatchCaseParser(module);
    nb::class_<CPGenParserImpl, CPGenAnalyzer, THostSubclass<CPGenParserImpl>> binding(
        module, "CPGenParserImpl", Collected<CPGenParserImpl>(),
        " Analyzes logical using a parser implemented via the pgen2 package ");
    binding
        .def(TInit<nb::object, nb::object, nb::object, bool>(), "version_triple"_a.none(),
             "grammar_file"_a = module.attr("kPy3DefaultGrammar"), "keyword_seq"_a = nb::none(),
             "py3_grammar"_a = true)
        .def_ro("_fVersionTriple", &CPGenParserImpl::_fVersionTriple, "The Python version analysed, a tuple.")
        .def_ro("_fAsyncAlwaysKeyword", &CPGenParserImpl::_fAsyncAlwaysKeyword,
                "True when `async` and `await` are keywords everywhere (3.7 on, PEP 492).")
        .def_ro("_fMatchCaseStatementParser", &CPGenParserImpl::_fMatchCaseStatementParser,
                "Parses `match` and `case` statements; a CMatchCaseStatementParser.");
    BindOperations(binding);
    binding.attr("kClsForState") = DirectClsForState();
}

}  // namespace codeloom
