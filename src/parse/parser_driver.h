// parse/: the tokens of one logical line into a typed tree.
//   in     token texts, their positions, and whether the line lies in an `async def`
//   out    the node of the one statement that the line holds, or none; ParseError on a token that is refused
//   keeps  the grammar's tables, the parser and the node factory, all reused
//   start  at CPGenParserImpl::ParseToNode; CTokenFeed shows which tokens are invented around the real ones
#pragma once

#include <nanobind/nanobind.h>

#include "analysis/pgen_analyzer.h"
#include "neighbours/optpgen/parser.h"
#include "parse/match_case_parser.h"
#include "tree/node_factory.h"

namespace codeloom {

// Makes one logical look like a complete file to the table-driven parser, and peels the result down to the
// statement.
class CPGenParserImpl : public CPGenAnalyzer {
  public:
    void Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq, bool py3_grammar);

    nb::object convert(nb::handle grammar, int type, nb::handle value, nb::handle context,
                       nb::handle children) override;
    nb::object ConvertRule(nb::handle grammar, int type, nb::handle context, CObjectStack& stack,
                           size_t first) override;
    virtual nb::list _BuildClsForStateList();
    virtual void DiscardNode(nb::handle node);
    virtual CNodeRef ParseToNode(CLogicalLine& logical, bool in_async_def);
    virtual CNodeRef ParseToksToNode(nb::object toks, bool in_async_def, CPositions positions);
    virtual CNodeRef _ParseToksToNodeImpl(nb::tuple toks, bool in_async_def, CPositions positions);
    virtual Py_ssize_t _FindNextNonSkipIndex(nb::tuple toks, Py_ssize_t index);
    virtual Py_ssize_t _NonNestedFindTokenIndex(nb::object target, nb::tuple toks, Py_ssize_t start,
                                                Py_ssize_t end);
    virtual CNodeRef _ParseSpecialCases(nb::tuple toks, bool in_async_def, CPositions positions);
    virtual CNodeRef _ParseSpecialCaseParenthesizedWith(nb::tuple toks, bool in_async_def,
                                                        CPositions positions, Py_ssize_t i);
    virtual CNodeRef _ParseSpecialCaseExceptStar(nb::tuple toks, bool in_async_def, CPositions positions,
                                                 Py_ssize_t i);
    virtual CNodeRef _ParseSpecialCaseWithTypeParameter(nb::tuple toks, bool in_async_def,
                                                        CPositions positions, Py_ssize_t i);
    virtual nb::list _NodesForTypeParameters(nb::tuple toks, bool in_async_def, CPositions positions,
                                             Py_ssize_t start, Py_ssize_t end, bool raise_errors);
    virtual CNodeRef _CreateSingleTypeParameterNode(nb::tuple toks, bool in_async_def, CPositions positions,
                                                    Py_ssize_t start, Py_ssize_t end, bool raise_errors);
    virtual void _RaiseParseError(nb::handle tok_i);
    virtual CNodeRef ParseTokenListToNode(nb::list toks, bool in_async_def);
    virtual void _AddTokenList(nb::list toks, Py_ssize_t tok_i);
    virtual bool _ShouldSkipSlash(Py_ssize_t tok_i, CPositions positions);
    virtual nb::list GetTypeParameterNodes(nb::tuple toks);

    // ParseToksToNode for toks[:end], the tokens before `start` removed. A driver of a host subclass makes
    // the copies that its operations want.
    virtual CNodeRef ParsePart(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                               Py_ssize_t start, Py_ssize_t end);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fGrammar);
        visit(_fKeywords);
        visit(_fParser);
        visit(_fNodeFactory);
        visit(_fClsForStateList);
        visit(__GetTime);
        visit(_fVersionTriple);
        visit(_fMatchCaseStatementParser);
    }

    bool IsKeyword(nb::handle tok) const { return DictContains(_fKeywords, tok); }

    nb::object _fVersionTriple = nb::none();  // the Python version analysed
    bool _fAsyncAlwaysKeyword = false;        // `async` and `await` are keywords everywhere
    CRef<CMatchCaseStatementParser> _fMatchCaseStatementParser;

  protected:
    CNodeRef _ParseCopyOfPart(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                              Py_ssize_t start, Py_ssize_t end);
    // The node of what stands behind `mark_i` in a type parameter that ends at `end`, its bound for one; none
    // when it is refused and errors aren't raised.
    CNodeRef _ParseBound(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                         Py_ssize_t mark_i, Py_ssize_t end, bool raise_errors);
    bool _HasSymbol(const char* symbol) const;
    int _NumberOfSymbol(const char* symbol) const;  // KeyError when the grammar has no such rule

    nb::object _fGrammar = nb::none();
    nb::object _fClsForStateList = nb::none();
    nb::object _fKeywords = nb::none();
    CRef<CNodeFactory> _fNodeFactory;

  private:
    friend class CTokenFeed;
    friend class CMatchCaseStatementParser;  // works on the same factory and keywords

    CNodeRef _ParseByGrammar(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                             Py_ssize_t start, Py_ssize_t end);
    CNodeRef _PeelRoot(nb::object parsed, bool is_decorator);

    bool _fPy3Grammar = true;
    int _fFileInputNumber = 0;
    CRef<Parser> _fParser;
    nb::object __GetTime = nb::none();
};

template <class Class>
class TParserDriverOperations : public TPGenAnalyzerOperations<Class> {
    OPERATIONS_BEYOND(TPGenAnalyzerOperations<Class>)
    OPERATION(
        _BuildClsForStateList,
        "The list that gives the node class for each token type and grammar state. Updates kClsForState.")
    OPERATION(DiscardNode, "Give a tree back to the free lists. AttributeError for None.", "node"_a.none())
    OPERATION(ParseToNode,
              "The node of a logical's statement, or None. ParseError on a token that the grammar\n"
              "refuses. Give it back with DiscardNode.",
              "logical"_a, "in_async_def"_a = false)
    OPERATION(ParseToksToNode, "ParseToNode for a tuple of tokens and their positions.", "toks"_a,
              "in_async_def"_a, "positions"_a.none())
    OPERATION(_ParseToksToNodeImpl, "Parse by the grammar alone, without the special cases.", "toks"_a,
              "in_async_def"_a, "positions"_a.none())
    OPERATION(_FindNextNonSkipIndex,
              "The first index beyond `index` whose token is neither removed nor empty, comment or\n"
              "backslash; the token count when there is none.",
              "toks"_a, "index"_a)
    OPERATION(_NonNestedFindTokenIndex,
              "The index in [start, end) of the token `target` outside brackets; -1 when there is none.",
              "target"_a, "toks"_a, "start"_a, "end"_a)
    OPERATION(_ParseSpecialCases,
              "The node of a statement that is parsed by hand; None for the ordinary road.", "toks"_a,
              "in_async_def"_a, "positions"_a.none())
    OPERATION(
        _ParseSpecialCaseParenthesizedWith,
        "A `with` whose items stand in parentheses, with `i` the index of `with`; None when they don't.",
        "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a)
    OPERATION(_ParseSpecialCaseExceptStar,
              "An `except*` clause (PEP 654), with `i` the index of `except`; None for another `except`.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a)
    OPERATION(_ParseSpecialCaseWithTypeParameter,
              "A `type`, `def` or `class` statement with type parameters (PEP 695), with `i` the index of\n"
              "its keyword; None for the ordinary road.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a)
    OPERATION(_NodesForTypeParameters,
              "The CTypeParameter nodes between the brackets at `start` and `end`. Without `raise_errors`\n"
              "malformed parameters are dropped.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "start"_a, "end"_a, "raise_errors"_a)
    OPERATION(_CreateSingleTypeParameterNode, "The node of the one type parameter in [start, end), or None.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "start"_a, "end"_a, "raise_errors"_a)
    OPERATION(_RaiseParseError, "Raise a ParseError at a token index.", "tok_i"_a)
    OPERATION(ParseTokenListToNode, "ParseToNode for a list of token texts, without the special cases.",
              "toks"_a, "in_async_def"_a = false)
    OPERATION(_AddTokenList, "Feed each token text to the parser, all with the context `tok_i`.", "toks"_a,
              "tok_i"_a)
    OPERATION(_ShouldSkipSlash,
              " Utility method to determine if slash (\\) token at tok_i --\n"
              "        can be relatively slow since slashes are uncommon and is usually called\n"
              "        after testing token is a slash. ",
              "tok_i"_a, "positions"_a.none())
    OPERATION(GetTypeParameterNodes,
              " Get type parameters defined in toks. Tries to ignore parse errors\n"
              "        and get all names if possible ",
              "toks"_a)
    END_OPERATIONS

    CNodeRef ParsePart(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                       Py_ssize_t start, Py_ssize_t end) override {
        return this->_ParseCopyOfPart(toks, in_async_def, positions, start, end);
    }
};

// Binds the driver, and the parser of `match` and `case` that it owns. `kClsForState` is set here, after all
// node classes exist.
// Where a grammar file lies.
nb::object PathOfGrammar(nb::object grammar_file);

void BindParserDriver(nb::module_& module);

}  // namespace codeloom
