// The analyzer for the language up to Python 3.14: the ordinary one, made with the parser of this folder.
#pragma once

#include "analysis/analyzer.h"

namespace codeloom {

class CNewerAnalyzer : public CPGenAnalyzerImpl {
  public:
    void Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq,
              nb::object py3_grammar, nb::object hint_grammar_file);
};

// Binds the analyzer and its parsers.
void BindNewerAnalyzer(nb::module_& module);

}  // namespace codeloom
