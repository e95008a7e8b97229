#include "analysis/analyzer.h"

#include <optional>

#include "analysis/embedded.h"
#include "host/errors.h"
#include "host/neighbour_call.h"
#include "neighbours/imported_names.h"
#include "parse/syntax_error.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kReportCurrentException("reflect", "ReportCurrentException");
constexpr CNeighbourFunction kRaiseWithTraceback("reflect", "RaiseWithTraceback");

// A fault of the walkers that isn't a syntax error, as a ValueError that names the line.
void RaiseCouldNotAnalyze(CLogicalLine& logical, const CHostError& inner) {
    const CHandlingScope handling(inner);
    const nb::object exc_info = HomeModule().attr("sys").attr("exc_info")();
    const nb::object text =
        nb::str("Could not analyze logical -- inner exception is {}\n  logical tokens: {}")
            .format(nb::repr(exc_info[1]), nb::str(" ").attr("join")(logical.GetToks()));
    kRaiseWithTraceback(nb::borrow(PyExc_ValueError)(text), exc_info[2]);
}

// What leaves an inspection whose walk failed: syntax errors and what isn't an Exception pass unchanged.
CHostError InspectionFailure(CLogicalLine& logical, CHostError error) {
    if (error.Is(PyExc_SyntaxError) || !error.Is(PyExc_Exception)) return error;
    try {
        RaiseCouldNotAnalyze(logical, error);
    } catch (const std::exception&) {
        return CHostError::Current();
    }
    return error;
}

}  // namespace

CAnalyzerParts PartsAround(CRef<CPGenParserImpl> parser, nb::object version_triple,
                           CRef<CPGenParserImpl> hint_parser) {
    CAnalyzerParts parts;
    parts.parser = std::move(parser);
    parts.node_walker = NewInstance<CNodeWalker>(version_triple);
    parts.type_hint_walker = MakeInstance<CTypeHintWalker>();
    parts.type_hint_walker->InitWithParser(std::move(hint_parser), parts.node_walker);
    return parts;
}

void CPGenAnalyzerImpl::Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
                             bool py3_grammar, nb::object hint_grammar_file) {
    CRef<CPGenParserImpl> parser =
        NewInstance<CPGenParserImpl>(version_triple, grammar_file, keyword_seq, py3_grammar);
    CRef<CPGenParserImpl> hint_parser = NewInstance<CPGenParserImpl>(version_triple, hint_grammar_file);
    InitFromParts(PartsAround(std::move(parser), version_triple, std::move(hint_parser)));
}

void CPGenAnalyzerImpl::InitFromParts(CAnalyzerParts parts) {
    _fLogicalParser = std::move(parts.parser);
    _fNodeWalker = std::move(parts.node_walker);
    _fTypeHintWalker = std::move(parts.type_hint_walker);
    __GetTime = HomeModule().attr("time").attr("time");
}

nb::object CPGenAnalyzerImpl::AnalyzeSingleLogical(CLogicalLine& logical, bool in_async_def,
                                                   bool first_in_def) {
    if (logical.fParsed) return nb::none();
    logical.MarkParsed(true);
    try {
        logical.ClearDerivedInfo();
        _InspectSingleLogical(logical, in_async_def, false, first_in_def);
        return nb::none();
    } catch (const std::exception&) {
        return _ErrorToReport(logical, CHostError::Current());
    }
}

// What the caller gets of a failure: syntax problems as an object, anything else as nothing but a log entry.
nb::object CPGenAnalyzerImpl::_ErrorToReport(CLogicalLine& logical, const CHostError& error) {
    const CHandlingScope handling(error);
    logical.ClearDerivedInfo();
    if (error.Is(ParseErrorClass()))
        return CreateSyntaxError(nb::str("invalid syntax"), logical.Self(), error.Value().attr("context"),
                                 nb::none());
    if (error.Is(PyExc_SyntaxError)) return error.Value();
    kReportCurrentException("suppress_gui"_a = true);
    return nb::none();
}

bool CPGenAnalyzerImpl::_InspectSingleLogical(CLogicalLine& logical, bool in_async_def,
                                              bool in_embedded_expression, bool first_in_def) {
    const bool is_comment = IsOfType(logical, gLogicalTypes.kComment);
    const CNodeRef node = is_comment ? CNodeRef() : _fLogicalParser->ParseToNode(logical, in_async_def);
    if (!node && !is_comment) return true;
    std::optional<CHostError> failure;
    try {
        _WalkAndInspect(logical, node, in_async_def, in_embedded_expression, first_in_def);
    } catch (const std::exception&) {
        failure = InspectionFailure(logical, CHostError::Current());
    }
    if (node) _fLogicalParser->DiscardNode(node.AsHost());
    if (failure) failure->Raise();
    return true;
}

void CPGenAnalyzerImpl::_WalkAndInspect(CLogicalLine& logical, const CNodeRef& node, bool in_async_def,
                                        bool in_embedded_expression, bool first_in_def) {
    _fNodeWalker->Walk(node, logical);
    _fTypeHintWalker->Walk(node, logical, first_in_def);
    if (!in_embedded_expression) _InspectEmbeddedExpressions(logical, node, in_async_def, first_in_def);
}

void CPGenAnalyzerImpl::_InspectEmbeddedExpressions(CLogicalLine& logical, CNodeRef, bool in_async_def,
                                                    bool first_in_def) {
    const nb::object exp_logicals = logical.GetExpLogicals();
    if (!nb::isinstance<nb::tuple>(exp_logicals)) RaiseWrongType("tuple", exp_logicals);
    for (Py_ssize_t i = 0; i < TupleSize(exp_logicals); ++i) {
        CLogicalLine& exp_logical = *Instance<CLogicalLine>(TupleItem(exp_logicals, i));
        if (IsOfType(exp_logical, gLogicalTypes.kCommentedTypeHint)) continue;
        _InspectEmbedded(logical, exp_logical, in_async_def, first_in_def);
        LiftTypeEquivs(exp_logical, logical);
    }
}

void CPGenAnalyzerImpl::_InspectEmbedded(CLogicalLine& logical, CLogicalLine& exp_logical, bool in_async_def,
                                         bool first_in_def) {
    try {
        _InspectSingleLogical(exp_logical, in_async_def, true, first_in_def);
    } catch (const std::exception&) {
        const CHostError error = CHostError::Current();
        if (!error.Is(ParseErrorClass())) error.Raise();
        const CHandlingScope handling(error);
        logical.ClearDerivedInfo();
        RaiseHostError(EmbeddedError(logical, exp_logical, error.Value().attr("context")));
    }
}

CNodeRef CPGenAnalyzerImpl::ParseToNode(CLogicalLine& logical, bool in_async_def) {
    return _fLogicalParser->ParseToNode(logical, in_async_def);
}

CNodeRef CPGenAnalyzerImpl::ParseTokenListToNode(nb::list logical, bool in_async_def) {
    return _fLogicalParser->ParseTokenListToNode(std::move(logical), in_async_def);
}

nb::list CPGenAnalyzerImpl::GetTypeParameterNodes(nb::tuple toks) {
    return _fLogicalParser->GetTypeParameterNodes(std::move(toks));
}

void BindAnalyzer(nb::module_& module) {
    nb::class_<CPGenAnalyzerImpl, CPGenAnalyzer, THostSubclass<CPGenAnalyzerImpl>> binding(
        module, "CPGenAnalyzerImpl", Collected<CPGenAnalyzerImpl>(),
        " Analyzes logical using a parser implemented via the pgen2 package ");
    const nb::object default_grammar = module.attr("kPy3DefaultGrammar");
    binding
        .def(TInit<nb::object, nb::object, nb::object, bool, nb::object>(), "version_triple"_a.none(),
             "grammar_file"_a = default_grammar, "keyword_seq"_a = nb::none(), "py3_grammar"_a = true,
             "hint_grammar_file"_a = default_grammar)
        .def_ro("_fNodeWalker", &CPGenAnalyzerImpl::_fNodeWalker, "The walker for names.")
        .def_ro("_fTypeHintWalker", &CPGenAnalyzerImpl::_fTypeHintWalker, "The walker for type hints.")
        .def(
            "ParseToNode",
            [](CPGenAnalyzerImpl& analyzer, CLogicalLine& logical, CTruth in_async_def) {
                return analyzer.ParseToNode(logical, in_async_def);
            },
            "logical"_a, "in_async_def"_a = false,
            "The node of a logical's statement, or None. ParseError on a token that the grammar refuses.")
        .def(
            "ParseTokenListToNode",
            [](CPGenAnalyzerImpl& analyzer, nb::list logical, CTruth in_async_def) {
                return analyzer.ParseTokenListToNode(std::move(logical), in_async_def);
            },
            "logical"_a, "in_async_def"_a = false,
            "The same for a list of token texts, without the special cases.")
        .def("GetTypeParameterNodes", &CPGenAnalyzerImpl::GetTypeParameterNodes, "toks"_a,
             " Get type parameters defined in toks. Tries to ignore parse errors\n"
             "        and get all names if possible ");
    BindOperations(binding);
}

}  // namespace codeloom
