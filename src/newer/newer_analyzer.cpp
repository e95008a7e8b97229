#include "newer/newer_analyzer.h"

#include "newer/newer_parser.h"

namespace codeloom {

void CNewerAnalyzer::Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
                          nb::object py3_grammar, nb::object hint_grammar_file) {
    const CRef<CNewerParser> parser =
        NewInstance<CNewerParser>(version_triple, grammar_file, keyword_seq, py3_grammar);
    // Hints in comments are read by type checkers, which know the forms of all versions.
    const CRef<CNewerParser> hint_parser = NewInstance<CNewerParser>(version_triple, hint_grammar_file);
    hint_parser->TakeAllForms();
    InitFromParts(PartsAround(CRef<CPGenParserImpl>(parser.get()), version_triple,
                              CRef<CPGenParserImpl>(hint_parser.get())));
}

void BindNewerAnalyzer(nb::module_& module) {
    BindNewerParser(module);
    nb::class_<CNewerAnalyzer, CPGenAnalyzerImpl, TAnalyzerOperations<CNewerAnalyzer>> binding(
        module, "CNewerAnalyzer", Collected<CNewerAnalyzer>(),
        "Analyzes logical lines of the language up to Python 3.14.");
    binding.def(TInit<nb::object, nb::object, nb::object, nb::object, nb::object>(),
                "version_triple"_a.none(), "grammar_file"_a = kNewerGrammar, "keyword_seq"_a = nb::none(),
                "py3_grammar"_a = true, "hint_grammar_file"_a = kNewerGrammar);
    BindOperations(binding);
}

}  // namespace codeloom
