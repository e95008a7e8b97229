// The analyzer for the language up to Python 3.14: the ordinary one, made with the parser of this folder.
#pragma once

#include "analysis/analyzer.h"
#include "extended/plain_analysis.h"

namespace codeloom {

class CExtendedAnalyzer : public CPGenAnalyzerImpl {
  public:
    void Init(nb::object version_triple, nb::object grammar_file, nb::object keyword_seq, bool py3_grammar,
              nb::object hint_grammar_file);

    // On plain data where no host code takes part.
    nb::object AnalyzeSingleLogical(CLogicalLine& logical, bool in_async_def, bool first_in_def) override;

  private:
    bool _AreWalkersAsMade() const;

    std::unique_ptr<CPlainAnalysis> _fPlain;  // null where host code may take part
    uint64_t _fVisitsVersion = 0;             // of the dictionary of visits as it was made
};

// Binds the analyzer and its parsers.
void BindExtendedAnalyzer(nb::module_& module);

}  // namespace codeloom
