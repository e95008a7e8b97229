// The parser of hints in comments: the text of one into a tree.
#pragma once

#include <optional>
#include <string>

#include "syntax/line_parser.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// A hint in a comment, after as many blanks as there are bytes before it: an offset is one in the comment.
struct CCommentHint {
    uint32_t token_i = 0;  // the comment
    uint32_t start = 0;    // of the comment in the file
    std::string text;
};

// Thrown for a hint that doesn't parse.
struct CHintRefusal {
    uint32_t offset;  // in the comment
};

// A part of a tree that is made of a hint. Good until the next hint is parsed.
struct CHintTree {
    const CTree* tree = nullptr;
    uint32_t shift = 0;  // from places in the hint's own text to those in the file, as unsigned numbers wrap

    explicit operator bool() const { return tree != nullptr; }
};

// Not for two threads at once.
class CHintParser {
  public:
    // For hints in the code of this version.
    explicit CHintParser(int version) : _fParser(HintLanguageOf(version)) {}

    // The tree of a hint; none when it isn't one expression.
    CHintTree ParseExpression(const CCommentHint& hint);

    // The `def` that the hint of a function is made; none when it doesn't make one.
    CHintTree ParseFunction(const CCommentHint& hint);

  private:
    CLineParser _fParser;
    std::string _fText;
    CRawLogical _fLine;
    CRawLogical _fRest;
    CTree _fTree;
};

}  // namespace codeloom
