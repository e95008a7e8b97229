#include "syntax/forms.h"

#include "tokenizer/string_lexer.h"

namespace codeloom {

std::string MessageOf(const CForm& form) {
    if (form.version == CForm::kNone) return std::string(form.name) + " ended with Python 2";
    return std::string(form.name) + " needs Python " + std::to_string(form.version / 100) + "." +
           std::to_string(form.version % 100);
}

const CForm* FormOfString(std::string_view text) {
    const CStringStart start = ReadStringStart(text, 0);
    const auto has = [prefix = text.substr(0, start.prefix_length)](const char* letters) {
        return prefix.find_first_of(letters) != std::string_view::npos;
    };
    if (start.has_fields) return has("tT") ? &forms::kTString : &forms::kFString;
    return has("uU") && has("rR") ? &forms::kRawUnicode : nullptr;
}

//   0777  10L       0  00  0_0  0x1F  0777.5  0777e1  0777j
const CForm* FormOfNumber(std::string_view text) {
    if (text.back() == 'L' || text.back() == 'l') return &forms::kLongNumber;
    if (text.front() != '0' || text.find_first_not_of("0123456789_") != std::string_view::npos)
        return nullptr;
    return text.find_first_not_of("0_") != std::string_view::npos ? &forms::kOldOctal : nullptr;
}

}  // namespace codeloom
