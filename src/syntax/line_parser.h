// The parser of logical lines: all statements of a version of the language.
#pragma once

#include <memory>

#include "syntax/fault.h"
#include "syntax/language.h"
#include "syntax/tree.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// Not for two threads at once.
class CLineParser {
  public:
    // `language` must outlive the parser.
    explicit CLineParser(const CLanguage& language);
    ~CLineParser();

    // The statement of a line, an embedded one too, into `tree`. On a fault the tree is undefined. A tree may
    // be empty without a fault: the line holds no statement then, or more than one.
    CFault Parse(const CRawLogical& logical, bool in_async_def, CTree& tree);

    // The same for tokens that only the grammar reads, in the order that they have, wherever they are:
    // statements beyond the grammar are refused, no form is.
    CFault ParseTokens(const CRawLogical& logical, bool in_async_def, CTree& tree);

  private:
    struct CParts;
    std::unique_ptr<CParts> _fParts;
};

}  // namespace codeloom
