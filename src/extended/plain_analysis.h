// The analysis of lines on plain data, for an analyzer in which no host code takes part.
//   in     the parameters of an analyzer; then logical lines that the tokenizer made
//   out    the same records and errors as the hosted form gives
//   keeps  the plain analyzer, and the records of one line
//   start  at CPlainAnalysis::TryMake
#pragma once

#include <memory>
#include <optional>

#include <nanobind/nanobind.h>

#include "extended/extended_parser.h"
#include "line/line_analyzer.h"
#include "neighbours/logicalline/logical_line.h"

namespace codeloom {

// What an analyzer was made with.
struct CAnalyzerParameters {
    nb::object version_triple;
    nb::object grammar_file;
    nb::object keyword_seq;
    bool py3_grammar;
    nb::object hint_grammar_file;
};

class CPlainAnalysis {
  public:
    // Null where the plain analyzer wouldn't do the same: for a mixture of versions, another grammar file,
    // node classes or functions of the host.
    static std::unique_ptr<CPlainAnalysis> TryMake(const CAnalyzerParameters& parameters,
                                                   const CExtendedParser& parser);

    explicit CPlainAnalysis(const CLanguage& language) : _fAnalyzer(language) {}

    // True for a line that it can take now.
    static bool CanTake(const CLogicalLine& logical);

    // What AnalyzeSingleLogical returns, with the records on the line. Nothing, and the line as it was, where
    // there is more to report than plain data can: a limit, or a failure that isn't a syntax error.
    std::optional<nb::object> Analyze(CLogicalLine& logical, bool in_async_def, bool first_in_def);

  private:
    void _SetRecords(CLogicalLine& logical);
    void _MakeRoom();

    CLineAnalyzer _fAnalyzer;
    CRawLogical _fLine;  // the one under way
    CRecords _fRecords;
};

// Takes the neighbours as they are now for the original ones.
void WatchNeighbours();

}  // namespace codeloom
