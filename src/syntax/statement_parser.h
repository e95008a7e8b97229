// The statements that the grammar files know.
//   in     a span of tokens, to which invented ones are added so that the tables see a whole file
//   out    the node of the one statement; CRefusal at a token that is refused
//   keeps  the parser that runs over the tables
//   start  at Parse
//
//   else: x = 1        if 0: pass NEWLINE | else: x = 1 | NEWLINE end
//   try:               | try: | pass NEWLINE finally: pass NEWLINE end
//   @foo.bar(1)        | @foo.bar(1) | NEWLINE def function(): pass NEWLINE end
//   class X:           | class X: | pass NEWLINE end
//                        the real tokens are between the bars
#pragma once

#include <initializer_list>

#include "syntax/language.h"
#include "syntax/table_parser.h"
#include "syntax/token_span.h"
#include "syntax/tree.h"

namespace codeloom {

class CStatementParser {
  public:
    // Both must outlive the parser. Forms that nodes show are noted.
    CStatementParser(const CLanguage& language, CFormNotes& forms);

    // The statement in `span`; none when it holds no statement, or more than one.
    CParsed Parse(const CTokenSpan& span, CTree& tree);

    // The atom that `span` is between invented parentheses, which are reported at these tokens.
    CParsed ParseInParentheses(const CTokenSpan& span, uint32_t open_i, uint32_t close_i, CTree& tree);

    struct CInvented {
        int16_t type;
        EWord word = EWord::kNone;
    };

  private:
    void _Begin(const CTokenSpan& span, CTree& tree);
    CParsed _ParseUnusual(const CTokenSpan& span, uint32_t first_i, CTree& tree);
    void _FeedHead(const CTokenSpan& span, uint32_t i);
    void _FeedAsync(uint32_t i);
    void _FeedSpan(const CTokenSpan& span, uint32_t from);
    void _FeedTokens(const CTokenSpan& span, uint32_t from, uint32_t to);
    void _FeedSpecial(const CTokenSpan& span, uint32_t i);
    void _FeedInvented(CInvented token, uint32_t i);
    void _FeedInvented(std::initializer_list<CInvented> tokens, uint32_t i);

    const CLanguage& _fLanguage;
    CTableParser _fTableParser;

    const CLeafClasses* _fClasses = nullptr;
    bool _fEndsWithColon = false;
};

}  // namespace codeloom
