// A version of the language: its grammar's tables, its keywords, and what forms of the language it has.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "syntax/node_kinds.h"
#include "syntax/tree.h"
#include "text/token_type.h"
#include "text/words.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CSyntaxGrammar;  // syntax/syntax_grammar.h

// What a token is to the parser, and how its leaf looks.
struct alignas(8) CLeafClass {
    uint16_t symbol = 0;
    ENodeKind kind = ENodeKind::kNode;
    EWord word = EWord::kNone;
    uint8_t label = 0;  // that the grammar's tables know it by; or one of those below
    uint8_t traits = 0;

    // Labels of tokens that aren't simply fed.
    static constexpr uint8_t kFirstSpecial = 253;
    static constexpr uint8_t kThreeDots = 253;  // an ellipsis in Python 2
    static constexpr uint8_t kBackslash = 254;
    static constexpr uint8_t kComment = 255;

    // Traits: a string or a number, whose text may be a form of some versions; a token with which a statement
    // may begin that the grammar's tables don't know as it is.
    static constexpr uint8_t kLiteral = 1;
    static constexpr uint8_t kBeginsUnusual = 2;

    bool IsSpecial() const { return label >= kFirstSpecial; }
    bool IsLiteral() const { return (traits & kLiteral) != 0; }
    bool BeginsUnusual() const { return (traits & kBeginsUnusual) != 0; }

    CTreeNode LeafAt(uint32_t token_i, uint32_t first_child = 0) const {
        return {first_child, 0, token_i, symbol, kind, word};
    }
};

// The class of every token, by its word or else by its type.
class CLeafClasses {
  public:
    const CLeafClass& Of(const CRawToken& token) const {
        return token.word == EWord::kNone ? OfType(token.type) : OfWord(token.word);
    }
    const CLeafClass& OfType(int type) const { return _fClasses[static_cast<size_t>(type)]; }
    const CLeafClass& OfWord(EWord word) const { return _fClasses[kFirstWord + static_cast<size_t>(word)]; }

    CLeafClass& OfType(int type) { return _fClasses[static_cast<size_t>(type)]; }
    CLeafClass& OfWord(EWord word) { return _fClasses[kFirstWord + static_cast<size_t>(word)]; }

  private:
    static constexpr size_t kFirstWord = kTokenId_BACKSLASH + 1;

    std::array<CLeafClass, kFirstWord + static_cast<size_t>(EWord::kCount)> _fClasses;
};

// The last rule of a chain of the grammar's tables, and the row of the rules around it.
struct CChainClass {
    int row_around = 0;
    uint16_t rule_number = 0;
    ENodeKind kind = ENodeKind::kNode;
    bool may_be_refused = false;  // a node of it may have a form that the language lacks
    bool is_line = false;         // simple statements and the newline after them
};

struct CLanguage {
    static constexpr int kOldest = 207;  // 2.7; 3.12 is 312
    static constexpr int kNewest = 315;
    static constexpr int kAllForms = INT32_MAX;

    int version = kNewest;
    int forms_version = kNewest;  // forms that came later are refused
    // False for Python 2, where statements beyond the grammar are taken as the old engine takes them.
    bool has_newer_statements = true;
    const CSyntaxGrammar* grammar = nullptr;
    std::vector<CChainClass> chain_classes;  // from 1
    std::array<CLeafClasses, 2>
        leaf_classes;  // by whether `async` and `await` are keywords where the line is

    bool IsPython3() const { return version >= 300; }
    bool HasAsyncKeywords() const { return version >= 307; }

    const CLeafClasses& LeafClasses(bool has_async_keywords) const {
        return leaf_classes[static_cast<size_t>(has_async_keywords)];
    }
    bool IsKeyword(EWord word) const {
        return leaf_classes[0].OfWord(word).kind == ENodeKind::kKeywordLiteral;
    }
};

// The one object for a version, made when it is first asked for; any thread may ask. In Python 2 `print` is a
// statement unless the text imports `print_function` from the future. Requires: `version` is known.
const CLanguage& LanguageOf(int version, bool has_print_function = false);

// The language of hints in comments within a text of `version`: type checkers know the forms of all versions.
const CLanguage& HintLanguageOf(int version);

// True for 207 and from 300 to 315.
bool IsKnownVersion(int version);

}  // namespace codeloom
