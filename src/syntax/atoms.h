// What atoms answer: brackets, literals, and the lists that brackets hold.
#pragma once

#include <string_view>

#include "syntax/expressions.h"
#include "text/char_class.h"

namespace codeloom {

// `(a)`, `[a, b]`, `{a: b}`, adjacent strings, and in the 2.7 grammar backquotes
//   child    bracket  [contents]  bracket
//   child    string  string ...
enum class EBracket : uint8_t { kNone, kParenthesis, kSquare, kCurly };

// The bracket that an atom begins with.
EBracket BracketOf(const CTree& tree, const CTreeNode& atom);

// What the brackets hold; null for empty ones.
inline const CTreeNode* ContentsOfBrackets(const CTree& tree, const CTreeNode& atom) {
    return atom.child_count == 3 ? &tree.Child(atom, 1) : nullptr;
}

// `[a for b in c]`, `{a: b for c in d}`
bool IsComprehension(const CTree& tree, const CTreeNode& atom);

// `{a, b}`
bool IsSetDisplay(const CTree& tree, const CTreeNode& atom);

// Adjacent strings.
bool AreAllStrings(const CTree& tree, const CTreeNode& atom);

// `a` for `(a)` and `((a))`; the node itself for anything else, a tuple and a generator in their parentheses
// included.
const CTreeNode& DropParentheses(const CTree& tree, const CTreeNode& node);

// True for a tuple, in parentheses of any number or in none.
bool IsTuple(const CTree& tree, const CTreeNode& node);

// True for a name and for a chain of names, `a.b.c`; for the first of them in parentheses too.
bool IsDottedName(const CTree& tree, const CTreeNode& node);

// The same for an atom and the trailers after it.
bool IsDottedChain(const CTree& tree, const CChain& chain);

// The items that a target or a value can be taken apart into: of a comma list, or of brackets that hold one
// or, square ones, a single item.
struct CItems {
    const CTreeNode* list = nullptr;    // its items are every other child, or
    const CTreeNode* single = nullptr;  // the only item; null for a comprehension
    uint32_t count = 0;

    // Requires: i < count. Null for what is in a comprehension.
    const CTreeNode* At(const CTree& tree, uint32_t i) const {
        if (list == nullptr) return single;
        return TryChild(tree, *list, i * 2, ENodeKind::kExpression);
    }
};

// Nothing for a plain expression, `(a)` included.
CItems ItemsOf(const CTree& tree, const CTreeNode& node);

// The same for a tuple in parentheses, whose single item may be in further ones. False for any other
// node.
bool IsParenthesizedTuple(const CTree& tree, const CTreeNode& node, CItems& items);

// Literals by their text

// True when the text holds a point or an `e`, be it the digit of a hexadecimal number.
inline bool IsFloatText(std::string_view number) {
    return number.find_first_of(".eE") != std::string_view::npos;
}

// True with this letter, in either case, as prefix, a raw marker before it allowed.
inline bool HasStringPrefix(std::string_view literal, char lower_letter) {
    if (!literal.empty() && AsLower(literal[0]) == 'r') literal.remove_prefix(1);
    return !literal.empty() && AsLower(literal[0]) == lower_letter;
}

inline bool IsBytesText(std::string_view literal) {
    return HasStringPrefix(literal, 'b');
}

inline bool IsUnicodeText(std::string_view literal) {
    return HasStringPrefix(literal, 'u');
}

// The source between the quotes, escapes as written; up to the end of an unterminated literal.
std::string_view ContentsOfString(std::string_view literal);

}  // namespace codeloom
