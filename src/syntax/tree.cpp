#include "syntax/tree.h"

#include <cassert>

#include "text/token_type.h"

namespace codeloom {

void CTree::_Grow(size_t count) {
    _fNodes.resize(2 * _fNodes.size() + count + kFewNodes);
}

std::string_view CTree::InventedText(const CTreeNode& leaf) {
    if (leaf.word != EWord::kNone) return TextOfWord(leaf.word);
    switch (leaf.symbol) {
        case kTokenId_NAME:
            return "function";
        case kTokenId_NUMBER:
            return "0";
        case kTokenId_NEWLINE:
            return "\n";
        case kTokenId_COLON:
            return ":";
        case kTokenId_DOT:
            return ".";
        case kTokenId_LPAR:
            return "(";
        default:
            assert(leaf.symbol == kTokenId_RPAR);
            return ")";
    }
}

}  // namespace codeloom
