#include "tokenizer/operators.h"

namespace codeloom {

COperator LongOperatorAt(std::string_view text, size_t pos) {
    const char first = ByteAt(text, pos);
    const char second = ByteAt(text, pos + 1);
    if (first == '-' && second == '>') return {kTokenId_RARROW, 2, EWord::kArrow};
    if (first == '<' && second == '>') return {kTokenId_NOTEQUAL, 2, EWord::kLessGreater};
    if (first == '.' && second == '.' && ByteAt(text, pos + 2) == '.') return {kTokenId_ELLIPSIS, 3};
    const COperatorForms& forms = kOperatorForms[static_cast<unsigned char>(first)];
    if (second == '=' && forms.with_equal) return {forms.with_equal, 2, forms.word_with_equal};
    if (second != first || !forms.doubled) return SingleOperator(first);
    if (forms.doubled_with_equal && ByteAt(text, pos + 2) == '=') return {forms.doubled_with_equal, 3};
    return {forms.doubled, 2};
}

}  // namespace codeloom
