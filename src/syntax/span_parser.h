// Every statement of the language: those of the grammar files, and those beyond them.
//   in     a span of tokens
//   out    the node of its statement; none when it holds no statement, or more than one; CRefusal
//   keeps  the parser of the grammar's statements and that of `match` and `case`, with their storage
//   start  at Parse
//
// One token can't decide these, so they are read by hand:
//   with (open(a) as f, open(b)):           bracketed_with.cpp
//   except* A:    except A, B:              here
//   @a[0].b                                 decorators.cpp
//   def f[T: int = str]():    type X = int  type_parameters.cpp
//   if a: type X = int                      type_aliases.cpp
//   lazy import a    [*a for a in b]        newest_forms.cpp
//   match a:    case [a, *b]:               match_case_parser.h
// Mostly the tokens in the way are passed over, and the grammar takes the others.
#pragma once

#include <vector>

#include "syntax/form_notes.h"
#include "syntax/language.h"
#include "syntax/match_case_parser.h"
#include "syntax/statement_parser.h"
#include "syntax/token_span.h"
#include "syntax/tree.h"

namespace codeloom {

class CSpanParser {
  public:
    // `language` must outlive the parser.
    explicit CSpanParser(const CLanguage& language);

    // Starts with another line, whose nodes go to `tree`.
    void Begin(CTree& tree) {
        _fTree = &tree;
        _fForms.Reset();
    }

    CParsed Parse(const CTokenSpan& span) {
        const uint32_t i = span.First();
        if (i < span.end && _fLanguage.LeafClasses(false).Of(span.Token(i)).BeginsUnusual())
            if (const CParsed node = _ParseBeyondGrammar(span, i)) return node;
        return ParseByGrammar(span);
    }

    // The same without the statements beyond the grammar, but for type aliases in a body.
    CParsed ParseByGrammar(const CTokenSpan& span) {
        uint32_t refused_i = 0;
        try {
            return _fStatementParser.Parse(span, *_fTree);
        } catch (const CRefusal& refusal) {
            refused_i = refusal.token_i;
        }
        return _ParseAfterRefusal(span, refused_i);
    }

    // What is in `span`, in parentheses that take the place of the tokens at `open_i` and `close_i`.
    CTreeNode ParseInParentheses(const CTokenSpan& span, uint32_t open_i, uint32_t close_i);
    // What is in the parentheses that are all of a node; or the node itself.
    CTreeNode WithoutParentheses(const CTreeNode& node) const;

    const CFormNotes& Forms() const { return _fForms; }
    const CLanguage& Language() const { return _fLanguage; }
    CTree& Tree() const { return *_fTree; }

    // The leaf of a token of the line that the grammar doesn't read.
    CTreeNode LeafOf(const CTokenSpan& span, uint32_t i) const;

  private:
    class CFewNodes;

    // In a body after its header the grammar doesn't know an alias, and stumbles over its name.
    CParsed _ParseAfterRefusal(const CTokenSpan& span, uint32_t token_i);
    CParsed _ParseBeyondGrammar(const CTokenSpan& span, uint32_t i);
    CParsed _ParseUnusual(const CTokenSpan& span, uint32_t i);
    template <class TParse>
    CParsed _ParseOrByGrammar(const CTokenSpan& span, TParse parse);
    CParsed _ParseNewestForms(const CTokenSpan& span, uint32_t token_i);
    CParsed _ParseAsync(const CTokenSpan& span, uint32_t async_i);
    CParsed _ParseExcept(const CTokenSpan& span, uint32_t except_i);
    void _RefuseTypesWithTarget(const CTokenSpan& span, uint32_t except_i) const;

    CParsed _ParseWith(const CTokenSpan& span, uint32_t with_i);
    CParsed _ParseDecorator(const CTokenSpan& span, uint32_t at_i);
    bool _FitsDecoratorRule(const CTokenSpan& span, uint32_t at_i) const;
    CParsed _ParseMatchOrCase(const CTokenSpan& span, uint32_t word_i);
    CParsed _ParseMatchOrCaseAlone(const CTokenSpan& span, uint32_t word_i);

    CParsed _ParseWithTypeParameters(const CTokenSpan& span, uint32_t word_i);
    CParsed _ParseTypeParametersAndRest(const CTokenSpan& span, uint32_t word_i);
    void _ParseTypeParameters(const CTokenSpan& span, uint32_t open_i, uint32_t close_i);
    CTreeNode _ParseTypeParameter(const CTokenSpan& span, uint32_t start, uint32_t end);
    void _ParseNameAndBound(const CTokenSpan& span, uint32_t start, uint32_t end, CFewNodes& children);
    CTreeNode _ParseDefault(const CTokenSpan& span, uint32_t equal_i, uint32_t end);
    CParsed _ParseBound(const CTokenSpan& span);

    bool _BeginsLazyImport(const CTokenSpan& span, uint32_t lazy_i) const;
    std::vector<CTokenRange> _RangesOfNewestForms(const CTokenSpan& span);

    bool _BeginsTypeAlias(const CTokenSpan& span, uint32_t type_i) const;
    void _RequireAlias(const CTreeNode& node) const;
    std::vector<CTokenRange> _RangesOfAliases(const CTokenSpan& span);

    void _RequireSingle(const CTreeNode& node) const;
    bool _IsPlainName(const CTokenSpan& span, uint32_t i) const;

    const CLanguage& _fLanguage;
    CFormNotes _fForms;
    CStatementParser _fStatementParser;
    CMatchCaseParser _fMatchCaseParser;
    CTree* _fTree = nullptr;
    std::vector<CTreeNode> _fNodes;  // children of what is being read by hand
    int _fNesting = 0;               // of statements in bounds
};

}  // namespace codeloom
