#include "tokenizer/code_signs.h"

#include <algorithm>

#include "tokenizer/keywords.h"
#include "tokenizer/operands.h"
#include "tokenizer/row_facts.h"

namespace codeloom {

namespace {

// `next` is a bracket or a dot tied to a name; in prose a blank comes before a bracket.
bool AreTied(const CRowToken& name, const CRowToken& next) {
    if (name.type != kTokenId_NAME || name.text.data() + name.text.size() != next.text.data()) return false;
    return next.text == "(" || next.text == "[" || next.text == ".";
}

bool AreWordsSideBySide(const CRowToken& word, const CRowToken& next) {
    return word.type == kTokenId_NAME && next.type == kTokenId_NAME &&
           AreOperandsSideBySide(word, next.text, 0);
}

bool IsAssignmentOrComparison(const CRowToken& token) {
    return token.text.back() == '=' && ByteKind(token.text.front()) == EByteKind::kOperator;
}

bool IsClosedTriple(const CRowToken& token) {
    return token.type == kTokenId_STRING && ReadStringStart(token.text, 0).IsTriple();
}

// The signs of code in a row whose quotes say nothing about where its strings are.
int SignsInText(std::string_view text) {
    int count = 0;
    for (size_t pos = 1; pos + 1 < text.size(); ++pos) {
        const char c = text[pos];
        const char next = text[pos + 1];
        if (c == '=') count += next == ' ' || next == '=';
        if (IsNameByte(text[pos - 1])) count += c == '(' || c == '[' || (c == '.' && IsNameByte(next));
        if (ByteKind(text[pos - 1]) == EByteKind::kCloser) count += ByteKind(c) == EByteKind::kCloser;
    }
    return count;
}

}  // namespace

bool HasCodeShape(const CTokenRow& row) {
    if (IsHeader(row) || (row.tokens.size() > 1 && StartsStatement(row.text, 0))) return true;
    CRowToken last;
    return std::any_of(row.tokens.begin(), row.tokens.end(), [&last](const CRowToken& token) {
        const bool is_call = token.text == "(" && AreTied(last, token);
        last = token;
        return is_call || token.text == "=" || token.text == "+=";
    });
}

bool HasSignsOfCode(const CTokenRow& row) {
    if (row.tokens.empty()) return false;
    int code = 0;
    int prose = 0;
    CRowToken last;
    for (const CRowToken& token : row.tokens) {
        code += AreTied(last, token) || IsAssignmentOrComparison(token);
        code += 2 * IsClosedTriple(token);
        prose += AreWordsSideBySide(last, token);
        last = token;
    }
    if (HasOpenQuote(row)) code = std::max(code, SignsInText(row.text));
    code += IsCompoundWord(row.tokens[0].word) + IsHeader(row) + StartsStatement(row.text, 0);
    prose += 2 * (last.text == ".");
    return code > 0 && code >= prose;
}

}  // namespace codeloom
