// extended/: the language beyond Python 3.8 for those who read whole files of it.
//   in     the same as its base classes
//   out    the same node classes, so that walkers need nothing new
//   keeps  the same
//   start  at CExtendedParser, which a host could have written with the operations that it overrides
//
// What one token can decide is in the grammar file of 3.14. Here is the rest:
//   with (x := f()) as y:   with (yield):   async with (a as b, c as d):   brackets that are and aren't
//   items'
//   @a[0].b                                 any expression as a decorator
//   type is x                               `type` as a name before a keyword: type_aliases.cpp
//   if a: type X = int                      an alias in a body on the row of its header
//   def f[T: int = str]():                  defaults of type parameters
//   lazy import a    [*a for a in b]        newest_forms.cpp
//   case a, b:                              in extended_match_case_parser.h
// What a line has that is newer than the version asked for is refused by its name: extended_forms.h.
#pragma once

#include "extended/extended_forms.h"
#include "parse/parser_driver.h"

namespace codeloom {

inline constexpr const char* kNewerGrammar = "Python-Grammar-3.14";

class CExtendedParser : public CPGenParserImpl {
  public:
    void Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq, bool py3_grammar);

    // Forms of every version are taken from now on.
    void TakeAllForms() { _fForms.SetVersion(nb::none()); }

    nb::object convert(nb::handle grammar, int type, nb::handle value, nb::handle context,
                       nb::handle children) override;
    nb::object ConvertRule(nb::handle grammar, int type, nb::handle context, CObjectStack& stack,
                           size_t first) override;
    nb::list _BuildClsForStateList() override;
    // SyntaxError for a form that is newer than the version asked for.
    CNodeRef ParseToNode(CLogicalLine& logical, bool in_async_def) override;
    CNodeRef _ParseToksToNodeImpl(nb::tuple toks, bool in_async_def, CPositions positions) override;
    CNodeRef _ParseSpecialCases(nb::tuple toks, bool in_async_def, CPositions positions) override;
    CNodeRef _ParseSpecialCaseParenthesizedWith(nb::tuple toks, bool in_async_def, CPositions positions,
                                                Py_ssize_t i) override;
    CNodeRef _ParseSpecialCaseExceptStar(nb::tuple toks, bool in_async_def, CPositions positions,
                                         Py_ssize_t i) override;
    CNodeRef _ParseSpecialCaseWithTypeParameter(nb::tuple toks, bool in_async_def, CPositions positions,
                                                Py_ssize_t i) override;
    nb::list _NodesForTypeParameters(nb::tuple toks, bool in_async_def, CPositions positions,
                                     Py_ssize_t start, Py_ssize_t end, bool raise_errors) override;
    CNodeRef _CreateSingleTypeParameterNode(nb::tuple toks, bool in_async_def, CPositions positions,
                                            Py_ssize_t start, Py_ssize_t end, bool raise_errors) override;

    template <class Visitor>
    void References(Visitor&& visit) {
        CPGenParserImpl::References(visit);
        _fForms.References(visit);
    }

    // Its trees are of the classes that they had before a host could change any.
    bool HasOriginalClasses() const;

  private:
    nb::list _WithNewerClasses(nb::list classes) const;
    // A node of this type, once its form is noted.
    nb::object _Noted(int type, nb::object node);
    CNodeRef _ParseMatchOrCase(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                               Py_ssize_t word_i);
    CNodeRef _ParseMatchCaseOrName(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                                   Py_ssize_t word_i);
    void _RefuseLastComma(const nb::tuple& toks, Py_ssize_t with_i);
    CNodeRef _ParseDecorator(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                             Py_ssize_t at_i);
    bool _FitsDecoratorRule(const nb::tuple& toks, Py_ssize_t at_i);
    bool _BeginsTypeAlias(const nb::tuple& toks, Py_ssize_t type_i);
    void _RequireAlias(const CNode& node);
    nb::tuple _WithoutAliases(const nb::tuple& toks, bool in_async_def, const CPositions& positions);
    bool _BeginsLazyImport(const nb::tuple& toks, Py_ssize_t lazy_i);
    nb::tuple _WithoutNewestForms(const nb::tuple& toks);
    bool _IsPlainName(const nb::tuple& toks, Py_ssize_t i) const;
    CNodeRef _ParseDefault(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                           Py_ssize_t equal_i, Py_ssize_t end, bool raise_errors);
    void _RequireSingle(const CNode& node);

    CExtendedForms _fForms;
};

void BindExtendedParser(nb::module_& module);

}  // namespace codeloom
