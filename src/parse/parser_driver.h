// parse/: the tokens of one logical line into a typed tree.
//   in     token texts, their positions, and whether the line lies in an `async def`
//   out    the node of the one statement that the line holds, or none; ParseError on a token that is refused
//   keeps  the grammar's tables, the parser and the node factory, all reused
//   start  at CPGenParserImpl::ParseToNode; CTokenFeed shows which tokens are invented around the real ones
#pragma once

#include <nanobind/nanobind.h>

#include "neighbours/optpgen/parser.h"
#include "parse/match_case_parser.h"
#include "parse/pgen_analyzer.h"
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
    OPERATIONS_OF(CPGenParserImpl, CPGenAnalyzer)
    OPERATION(
        nb::list, _BuildClsForStateList, (),
        "The list that gives the node class for each token type and grammar state. Updates kClsForState.");
    OPERATION(void, DiscardNode, (nb::handle node),
              "Give a tree back to the free lists. AttributeError for None.", "node"_a.none());
    OPERATION(CNodeRef, ParseToNode, (CLogicalLine& logical, bool in_async_def),
              "The node of a logical's statement, or None. ParseError on a token that the grammar\n"
              "refuses. Give it back with DiscardNode.",
              "logical"_a, "in_async_def"_a = false);
    OPERATION(CNodeRef, ParseToksToNode, (nb::object toks, bool in_async_def, CPositions positions),
              "ParseToNode for a tuple of tokens and their positions.", "toks"_a, "in_async_def"_a,
              "positions"_a.none());
    OPERATION(CNodeRef, _ParseToksToNodeImpl, (nb::tuple toks, bool in_async_def, CPositions positions),
              "Parse by the grammar alone, without the special cases.", "toks"_a, "in_async_def"_a,
              "positions"_a.none());
    OPERATION(Py_ssize_t, _FindNextNonSkipIndex, (nb::tuple toks, Py_ssize_t index),
              "The first index beyond `index` whose token is neither removed nor empty, comment or\n"
              "backslash; the token count when there is none.",
              "toks"_a, "index"_a);
    OPERATION(Py_ssize_t, _NonNestedFindTokenIndex,
              (nb::object target, nb::tuple toks, Py_ssize_t start, Py_ssize_t end),
              "The index in [start, end) of the token `target` outside brackets; -1 when there is none.",
              "target"_a, "toks"_a, "start"_a, "end"_a);
    OPERATION(CNodeRef, _ParseSpecialCases, (nb::tuple toks, bool in_async_def, CPositions positions),
              "The node of a statement that is parsed by hand; None for the ordinary road.", "toks"_a,
              "in_async_def"_a, "positions"_a.none());
    OPERATION(CNodeRef, _ParseSpecialCaseParenthesizedWith,
              (nb::tuple toks, bool in_async_def, CPositions positions, Py_ssize_t i),
              "A `with` whose items are in parentheses, with `i` the index of `with`; None when they aren't.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a);
    OPERATION(CNodeRef, _ParseSpecialCaseExceptStar,
              (nb::tuple toks, bool in_async_def, CPositions positions, Py_ssize_t i),
              "An `except*` clause (PEP 654), with `i` the index of `except`; None for another `except`.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a);
    OPERATION(CNodeRef, _ParseSpecialCaseWithTypeParameter,
              (nb::tuple toks, bool in_async_def, CPositions positions, Py_ssize_t i),
              "A `type`, `def` or `class` statement with type parameters (PEP 695), with `i` the index of\n"
              "its keyword; None for the ordinary road.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "i"_a);
    OPERATION(nb::list, _NodesForTypeParameters,
              (nb::tuple toks, bool in_async_def, CPositions positions, Py_ssize_t start, Py_ssize_t end,
               bool raise_errors),
              "The CTypeParameter nodes between the brackets at `start` and `end`. Without `raise_errors`\n"
              "malformed parameters are dropped.",
              "toks"_a, "in_async_def"_a, "positions"_a.none(), "start"_a, "end"_a, "raise_errors"_a);
    OPERATION(CNodeRef, _CreateSingleTypeParameterNode,
              (nb::tuple toks, bool in_async_def, CPositions positions, Py_ssize_t start, Py_ssize_t end,
               bool raise_errors),
              "The node of the one type parameter in [start, end), or None.", "toks"_a, "in_async_def"_a,
              "positions"_a.none(), "start"_a, "end"_a, "raise_errors"_a);
    OPERATION(void, _RaiseParseError, (nb::handle tok_i), "Raise a ParseError at a token index.", "tok_i"_a);
    OPERATION(CNodeRef, ParseTokenListToNode, (nb::list toks, bool in_async_def),
              "ParseToNode for a list of token texts, without the special cases.", "toks"_a,
              "in_async_def"_a = false);
    OPERATION(void, _AddTokenList, (nb::list toks, Py_ssize_t tok_i),
              "Feed each token text to the parser, all with the context `tok_i`.", "toks"_a, "tok_i"_a);
    OPERATION(bool, _ShouldSkipSlash, (Py_ssize_t tok_i, CPositions positions),
              " Utility method to determine if slash (\\) token at tok_i --\n"
              "        can be relatively slow since slashes are uncommon and is usually called\n"
              "        after testing token is a slash. ",
              "tok_i"_a, "positions"_a.none());
    OPERATION(nb::list, GetTypeParameterNodes, (nb::tuple toks),
              " Get type parameters defined in toks. Tries to ignore parse errors\n"
              "        and get all names if possible ",
              "toks"_a);

    template <class Below>
    class TOfHost : public Below {
      public:
        CNodeRef ParsePart(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                           Py_ssize_t start, Py_ssize_t end) override {
            return this->_ParseCopyOfPart(toks, in_async_def, positions, start, end);
        }
    };
    FOR_HOST_SUBCLASSES(TOfHost)
    END_OPERATIONS

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
    // The node of what follows `mark_i` in a type parameter that ends at `end`, its bound for one; none
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

// Binds the driver, and the parser of `match` and `case` that it owns. `kClsForState` is set here, after all
// node classes exist.
// Where a grammar file lies.
nb::object PathOfGrammar(nb::object grammar_file);

void BindParserDriver(nb::module_& module);

}  // namespace codeloom
