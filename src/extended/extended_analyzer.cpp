#include "extended/extended_analyzer.h"

#include "extended/extended_parser.h"
#include "parse/class_table.h"

namespace codeloom {

void CExtendedAnalyzer::Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
                             bool py3_grammar, nb::object hint_grammar_file) {
    const CRef<CExtendedParser> parser =
        NewInstance<CExtendedParser>(version_triple, grammar_file, keyword_seq, py3_grammar);
    _fPlain.reset();
    // Hints in comments are read by type checkers, which know the forms of all versions.
    const CRef<CExtendedParser> hint_parser = NewInstance<CExtendedParser>(version_triple, hint_grammar_file);
    hint_parser->TakeAllForms();
    InitFromParts(PartsAround(CRef<CPGenParserImpl>(parser.get()), version_triple,
                              CRef<CPGenParserImpl>(hint_parser.get())));
    _fVisitsVersion = DictVersion(_fTypeHintWalker->GetDispatchDict());
    if (nb::inst_python_derived(Self())) return;
    _fPlain = CPlainAnalysis::TryMake(
        {version_triple, grammar_file, keyword_seq, py3_grammar, hint_grammar_file}, *parser);
}

nb::object CExtendedAnalyzer::AnalyzeSingleLogical(CLogicalLine& logical, bool in_async_def,
                                                   bool first_in_def) {
    if (_fPlain && !logical.fParsed && _AreWalkersAsMade() && CPlainAnalysis::CanTake(logical))
        if (const std::optional<nb::object> error = _fPlain->Analyze(logical, in_async_def, first_in_def))
            return *error;
    return CPGenAnalyzerImpl::AnalyzeSingleLogical(logical, in_async_def, first_in_def);
}

// A host may set fields of the walkers, and the visits in the dictionary.
bool CExtendedAnalyzer::_AreWalkersAsMade() const {
    const CNodeToTextConverterImpl& to_text = *_fNodeWalker->_fToText;
    const CNodeToTextConverterImpl& hint_text = *_fTypeHintWalker->_fHintConv;
    const CNodeToTextConverterImpl& name_text = *_fTypeHintWalker->_fNameConv;
    const bool are_texts_as_made =
        to_text._fIncludeBracketText && to_text._fIncludeStringContents && to_text._fIncludeArgText &&
        hint_text._fIncludeBracketText && hint_text._fIncludeStringContents && !hint_text._fIncludeArgText &&
        !name_text._fIncludeBracketText && !name_text._fIncludeStringContents && !name_text._fIncludeArgText;
    return are_texts_as_made && _fNodeWalker->_fIncludeExprText && _fNodeWalker->_fPy3 &&
           DictVersion(_fTypeHintWalker->GetDispatchDict()) == _fVisitsVersion;
}

void BindExtendedAnalyzer(nb::module_& module) {
    BindExtendedParser(module);
    RememberClsForState();
    WatchNeighbours();
    nb::class_<CExtendedAnalyzer, CPGenAnalyzerImpl, THostSubclass<CExtendedAnalyzer>> binding(
        module, "CExtendedAnalyzer", Collected<CExtendedAnalyzer>(),
        "Analyzes logical lines of the language up to Python 3.14.");
    binding.def(TInit<nb::object, nb::object, nb::object, bool, nb::object>(), "version_triple"_a.none(),
                "grammar_file"_a = kNewerGrammar, "keyword_seq"_a = nb::none(), "py3_grammar"_a = true,
                "hint_grammar_file"_a = kNewerGrammar);
    BindOperations(binding);
}

}  // namespace codeloom
