#include "neighbours/symbolinfo/nested_text.h"

#include <algorithm>
#include <string_view>

#include "neighbours/fastaccess/string_end.h"
#include "text/char_class.h"

namespace codeloom {

Py_ssize_t _NonInlineNextNonNestedUtf8PtrIndex(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    const std::string_view text(utf8_ptr, static_cast<size_t>(end_pos));
    size_t i = static_cast<size_t>(pos);
    Py_ssize_t open = 0;
    do {
        const EByteKind kind = ByteKind(text[i]);
        if (kind == EByteKind::kOpener) ++open;
        if (kind == EByteKind::kCloser) --open;
        i = kind == EByteKind::kQuote ? FindStringLiteralEnd(text, i) : i + 1;
    } while (open > 0 && i < text.size());
    return static_cast<Py_ssize_t>(i);
}

}  // namespace codeloom
