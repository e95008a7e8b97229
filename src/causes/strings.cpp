// A string that isn't closed.

#include "causes/recognisers.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

// `'C:\'`: what looks like the end of the string is escaped.
bool MayHaveEscapedEnd(std::string_view text, char quote) {
    const size_t end = text.find_last_not_of(" \t");
    return end != std::string_view::npos && end > 1 && text[end] == quote && text[end - 1] == '\\';
}

bool BeginsField(std::string_view contents) {
    const size_t open_count = contents.size() - (contents.find_last_not_of('{') + 1);
    return open_count % 2 == 1;
}

}  // namespace

CCause UnterminatedString(const CFaultyLine& line, int i) {
    if (!line.Is(i, kTokenId_ERRORTOKEN)) return {};
    const std::string_view text = line.Text(i);
    const size_t quote_pos = text.find_first_of("'\"");
    if (quote_pos == std::string_view::npos || quote_pos > 2) return {};
    const CStringStart start = ReadStringStart(text, 0);
    const char quote = text[quote_pos];
    const std::string_view kind = start.has_fields ? "f-string" : "string";
    const std::string_view rest = text.substr(quote_pos + 1);
    const bool is_triple = rest.size() > 1 && rest[0] == quote && rest[1] == quote;
    if (is_triple)
        return line.Problem(ECode::kUnterminatedTriple, i, i,
                            Joined("unterminated triple-quoted ", kind, " literal"),
                            Joined("close it with ", std::string(3, quote)));
    if (start.has_fields && rest.ends_with(quote) && BeginsField(rest.substr(0, rest.size() - 1)))
        return line.Problem(ECode::kFieldNotClosed, i, i, "f-string: expecting '}'",
                            "write '{{' for a brace that is text");
    const bool is_escaped = MayHaveEscapedEnd(rest, quote);
    return line.Problem(
        ECode::kUnterminatedString, i, i,
        Joined("unterminated ", kind, " literal", is_escaped ? "; perhaps you escaped the end quote?" : ""),
        is_escaped ? "write '\\\\' for a backslash that is text"
                   : Joined("close it with ", std::string(1, quote)));
}

// `'it's here'`
CCause QuoteInString(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(i - 1, kTokenId_STRING) || !line.Is(i, kTokenId_NAME) || !line.IsAdjacent(i)) return {};
    for (int later_i = i + 1; later_i < line.Count(); ++later_i) {
        const CCause later = UnterminatedString(line, later_i);
        if (!later || line.Text(later_i).back() == '\\') continue;
        const std::string quote(1, line.Text(i - 1).back());
        return line.Problem(
            ECode::kUnterminatedString, i - 1, i,
            "unterminated string literal; perhaps a quote within the string ended it?",
            Joined("write \\", quote, " for a quote that is text, or use other quotes around it"));
    }
    return {};
}

// `fu'text'`
CCause UnknownPrefix(const CFaultyLine& line, int i) {
    constexpr size_t kLongest = 3;
    if (!line.Is(i, kTokenId_STRING) || !line.IsAdjacent(i) || !line.IsName(i - 1)) return {};
    if (line.Text(i - 1).size() > kLongest) return {};
    return line.Problem(ECode::kUnknownPrefix, i - 1, i,
                        Joined(Quoted(line.Text(i - 1)), " isn't a prefix of a string"),
                        "the prefixes are r, b, f, t and u, some of them together");
}

}  // namespace codeloom
