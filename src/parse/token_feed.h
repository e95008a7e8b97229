// Feeds the tokens of one logical to the parser, with invented tokens that make the logical a complete file.
//
//   else: x = 1        if 0: pass NEWLINE | else: x = 1 | NEWLINE end
//   try:               | try: | pass NEWLINE finally: pass NEWLINE end
//   @foo.bar(1)        | @foo.bar(1) | NEWLINE def function(): pass NEWLINE end
//   class X:           | class X: | pass NEWLINE end
//                        the real tokens are between the bars
#pragma once

#include "parse/parser_driver.h"

namespace codeloom {

class CTokenFeed {
  public:
    // Sets the parser up for a new file, which toks[start:end] is to become.
    CTokenFeed(CPGenParserImpl& driver, const nb::tuple& toks, bool in_async_def, const CPositions& positions,
               Py_ssize_t start, Py_ssize_t end);

    // Feeds the tokens and the invented ones around them.
    void FeedAll();

    bool IsDecorator() const { return _fIsDecorator; }

  private:
    void _FeedToken(Py_ssize_t i);
    int _BeginStatement(nb::handle& tok, std::string_view text, int type, Py_ssize_t i);
    bool _IsSkipped(int type, Py_ssize_t i);
    void _FeedThreeDots(nb::handle tok, Py_ssize_t i);
    void _CompleteStatement();
    void _FeedInventedHead(std::initializer_list<const char*> texts, Py_ssize_t i);
    void _FeedInventedTail(std::initializer_list<const char*> texts);

    CPGenParserImpl& _fDriver;
    Parser& _fParser;
    const nb::tuple& _fToks;
    const CPositions& _fPositions;
    const CRawToken* const _fRawTokens;  // which have the types of the tokens; may be null
    const Py_ssize_t _fStart;
    const Py_ssize_t _fEnd;
    bool _fAsyncIsKeyword;
    bool _fIsDecorator = false;
    int _fLastFedType = -1;
    nb::object _fFirstToken;  // invalid until a real token has been fed
};

}  // namespace codeloom
