// causes/: why a line has a fault, in words.
//   in     a fault of the parser, and the line that has it
//   out    a CProblem that names the cause, and a hint where a usual slip is recognised
//   keeps  a parser, which is asked what would make the line sound
//   start  at CCauses::Of; the causes and their order are in causes.cpp, one idea a file
// Only lines with a fault come here, so sound text pays nothing for it.
#pragma once

#include <memory>

#include "rules/problem.h"
#include "syntax/fault.h"
#include "syntax/language.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CLineProbe;

// Not for two threads at once.
class CCauses {
  public:
    // `language` must outlive it.
    explicit CCauses(const CLanguage& language);
    ~CCauses();

    // Requires: a fault of `line`, and not that it is too long.
    CProblem Of(const CFault& fault, const CRawLogical& line);

  private:
    const CLanguage& _fLanguage;
    std::unique_ptr<CLineProbe> _fProbe;  // made for the first fault
};

}  // namespace codeloom
