#include "neighbours/fastaccess/string_end.h"

#include <algorithm>

#include "tokenizer/fstring_scanner.h"
#include "tokenizer/lexer.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

// As far as the fields of an f-string are looked at: broken ones are scanned in vain, once for each quote.
constexpr size_t kMaxFieldScan = 512;

// Where the literal with its opening quote at `quote_pos` begins, its prefix included.
size_t PrefixStart(std::string_view text, size_t quote_pos) {
    size_t start = quote_pos;
    while (start > 0 && quote_pos - start < 3 && ByteKind(text[start - 1]) == EByteKind::kNameStart) --start;
    const bool in_a_name = start > 0 && IsNameByte(text[start - 1]);
    return in_a_name || quote_pos - start > 2 ? quote_pos : start;
}

}  // namespace

size_t FindStringLiteralEnd(std::string_view text, size_t quote_pos) {
    const size_t prefix_start = PrefixStart(text, quote_pos);
    CStringStart start = ReadStringStart(text, prefix_start);
    if (start.has_fields) {
        CLexer lexer(text.substr(0, std::min(text.size(), quote_pos + kMaxFieldScan)));
        const CStringEnd found =
            CFstringScanner(lexer, nullptr, 0).Scan(quote_pos + start.quote_length, start);
        if (found.is_closed) return found.end;
    }
    if (start.quote_length == 0) start = ReadStringStart(text, quote_pos);
    return FindStringEnd(text, quote_pos + start.quote_length, start.quote, start.IsTriple()).end;
}

Py_ssize_t _FindStringEndNonNested(const tNonNestedStruct& search, Py_ssize_t quote_i) {
    if (search.to_search == nullptr || quote_i < 0 || quote_i >= search.end) {
        PyErr_SetString(PyExc_IndexError, "quote index lies outside the text searched");
        return -2;
    }
    const std::string_view text(search.to_search, static_cast<size_t>(search.end));
    return static_cast<Py_ssize_t>(FindStringLiteralEnd(text, static_cast<size_t>(quote_i)));
}

}  // namespace codeloom
