// What is in braces in an f-string or a t-string.

#include <string>

#include "causes/recognisers.h"
#include "text/char_class.h"
#include "text/unicode_names.h"

namespace codeloom {

namespace {

bool IsSpace(char c) {
    return IsBlank(c) || c == '\n' || c == '\r' || c == '\f';
}

// The string that holds the field; null where it isn't found.
const CRawToken* StringOf(const CFaultyLine& line) {
    const uint32_t start = line.Token(0).start;
    for (const CRawToken& token : line.Outer().tokens)
        if (token.start <= start && start < token.start + token.length) return &token;
    return nullptr;
}

// "f-string: "
std::string PrefixOf(const CFaultyLine& line) {
    const CRawToken* const string = StringOf(line);
    const std::string_view text = string == nullptr ? "" : TextOf(*string, line.FileText());
    const bool is_template =
        text.substr(0, text.find_first_of("'\"")).find_first_of("tT") != std::string_view::npos;
    return is_template ? "t-string: " : "f-string: ";
}

// How many braces are open before the place, as far as the string shows it.
int BracesOpenBefore(const CFaultyLine& line, uint32_t pos) {
    const CRawToken* const string = StringOf(line);
    if (string == nullptr) return 0;
    const std::string_view text = line.FileText();
    int open = 0;
    for (uint32_t i = string->start; i < pos; ++i) {
        const bool is_double = open == 0 && i + 1 < pos && text[i + 1] == text[i];
        if (text[i] == '{' && is_double) {
            ++i;
        } else if (text[i] == '{') {
            ++open;
        } else if (text[i] == '}' && open > 0) {
            --open;
        }
    }
    return open;
}

// The first token is the brace of the field itself: the tokenizer found no end of the field.
bool IsUnfinished(const CFaultyLine& line) {
    if (!line.IsField() || !line.Is(0, kTokenId_LBRACE)) return false;
    const std::string_view text = line.FileText();
    uint32_t pos = line.Token(0).start;
    while (pos > 0 && IsSpace(text[pos - 1])) --pos;
    uint32_t brace = pos;
    while (brace > 0 && text[brace - 1] == '{') --brace;
    return (pos - brace) % 2 == 0;
}

// What comes after the last token of the field.
std::string_view RestOf(const CFaultyLine& line) {
    const CRawToken& last = line.Token(line.Count() - 1);
    const std::string_view text = line.FileText();
    size_t pos = last.start + last.length;
    while (pos < text.size() && IsSpace(text[pos])) ++pos;
    return text.substr(pos);
}

CProblem ProblemOfRest(const CFaultyLine& line, std::string_view rest, ECode code, std::string message) {
    const auto start = static_cast<uint32_t>(rest.data() - line.FileText().data());
    return line.ProblemAt(code, start, start + 1, std::move(message));
}

// `{ = }` shows its text, of which there is none.
bool EndsInEqual(std::string_view text) {
    while (!text.empty() && IsSpace(text.back())) text.remove_suffix(1);
    return text.ends_with('=');
}

CProblem RequiredBefore(const CFaultyLine& line, char next) {
    return line.Problem(
        ECode::kEmptyField, 0, line.At(),
        Joined(PrefixOf(line), "valid expression required before '", std::string(1, next), "'"),
        next == '}' ? "write '{{}}' for braces that are text" : "");
}

CProblem ProblemOfCloser(const CFaultyLine& line, std::string_view rest) {
    const int opener_i = line.OpenerBefore(line.Count());
    const std::string closer(1, rest[0]);
    if (opener_i <= 0) {
        if (closer == "}" && line.Count() == 1) return RequiredBefore(line, '}');
        return ProblemOfRest(line, rest, ECode::kUnmatchedCloser,
                             Joined(PrefixOf(line), "unmatched '", closer, "'"));
    }
    CProblem problem =
        ProblemOfRest(line, rest, ECode::kMismatchedCloser,
                      Joined("closing parenthesis '", closer, "' does not match opening parenthesis ",
                             Quoted(line.Text(opener_i))));
    problem.related.push_back(line.Related(opener_i, "opened here"));
    return problem;
}

// After `!`, which is the first character of `rest`.
CCause ConversionIn(const CFaultyLine& line, std::string_view rest) {
    const auto wrong = [&](size_t length, std::string message) {
        CProblem problem =
            ProblemOfRest(line, rest, ECode::kInvalidConversion, Joined(PrefixOf(line), message));
        problem.end += static_cast<uint32_t>(length);
        return problem;
    };
    const std::string_view after = rest.substr(1);
    if (after.empty() || after[0] == '\'' || after[0] == '"') return {};
    if (IsSpace(after[0])) return wrong(0, "conversion type must come right after the exclamation mark");
    if (after[0] == '}' || after[0] == ':') return wrong(0, "missing conversion character");
    const size_t length = NameEnd(after, 0);
    const std::string_view name = after.substr(0, length);
    const std::string expected = ": expected 's', 'r', or 'a'";
    if (name.empty() || IsDigit(name[0])) return wrong(1, "invalid conversion character");
    if (name != "s" && name != "r" && name != "a")
        return wrong(length, Joined("invalid conversion character ", Quoted(name), expected));
    const char next = ByteAt(after, length);
    if (next == '}' || next == ':' || next == '\'' || next == '"') return {};
    return wrong(length, "expecting ':' or '}'");
}

CProblem NotClosed(const CFaultyLine& line, std::string_view words) {
    return line.Problem(ECode::kFieldNotClosed, 0, 0, Joined(PrefixOf(line), words),
                        "write '{{' for a brace that is text");
}

}  // namespace

// `f'{a'`, `f'{a:'`, `f'{a(}'`
CCause UnfinishedField(const CFaultyLine& line) {
    if (!IsUnfinished(line)) return {};
    const std::string_view rest = RestOf(line);
    const char next = ByteAt(rest, 0);
    if (next == ')' || next == ']' || next == '}') return ProblemOfCloser(line, rest);
    const std::string_view lone = line.Count() == 2 ? line.Text(1) : rest.substr(0, 1);
    const bool is_empty = line.Count() == 1 || (line.Count() == 2 && line.At() == 1);
    if (is_empty && (lone == "!" || lone == ":" || lone == "=")) return RequiredBefore(line, lone[0]);
    if (is_empty && (lone == ";" || lone == ","))
        return line.Problem(ECode::kFieldExpression, line.At(), line.At(),
                            Joined(PrefixOf(line), "expecting a valid expression after '{'"));
    if (next == '!')
        if (CCause cause = ConversionIn(line, rest)) return cause;
    const CRawToken* const string = StringOf(line);
    const std::string_view text = string == nullptr ? "" : TextOf(*string, line.FileText());
    const bool is_other_quote = (next == '"' || next == '\'') && !text.ends_with(next);
    if (is_other_quote)
        return ProblemOfRest(line, rest, ECode::kUnterminatedString, "unterminated string literal");
    if (next == '#')
        return line.Problem(ECode::kNeverClosed, 0, 0, "'{' was never closed",
                            "'#' begins a comment in a field");
    if (next == ':' || (next == '!' && rest.substr(0, 3).ends_with(':')))
        return NotClosed(line, "expecting '}', or format specs");
    return NotClosed(line, "expecting '}'");
}

// `f'{}'`, `f'{!r}'`, `f'}'`
CCause EmptyField(const CFaultyLine& line) {
    if (!line.IsField() || line.At() != 0) return {};
    const std::string_view text = line.Text(0);
    const bool is_brace = text == "}";
    if (is_brace && BracesOpenBefore(line, line.Token(0).start) == 0)
        return line.Problem(ECode::kSingleBrace, 0, 0, Joined(PrefixOf(line), "single '}' is not allowed"),
                            "write '}}' for a brace that is text");
    if (EndsInEqual(line.FileText().substr(0, line.Token(0).start))) return RequiredBefore(line, '=');
    if (is_brace || text == "!" || text == ":" || text == "=") return RequiredBefore(line, text[0]);
    return {};
}

// `f'{a!x}'`
CCause Conversion(const CFaultyLine& line) {
    if (!line.IsField() || line.Text(line.At()) != "!") return {};
    return ConversionIn(line, line.FileText().substr(line.Token(line.At()).start));
}

// `f'{lambda x: 1}'`, `f'{,}'`
CCause FieldExpression(const CFaultyLine& line) {
    if (!line.IsField()) return {};
    const int lambda_i = line.FindBack(0, line.At(), EWord::kLambda);
    if (lambda_i >= 0 && line.IsAtEnd() && line.FindBack(lambda_i, line.At(), kTokenId_COLON) < 0)
        return line.Problem(ECode::kFieldExpression, lambda_i, line.At(),
                            Joined(PrefixOf(line), "lambda expressions are not allowed without parentheses"),
                            "the ':' begins the format");
    if (line.EndsOperand(line.At() - 1)) return {};
    return line.Problem(ECode::kFieldExpression, line.At(), line.At(),
                        Joined(PrefixOf(line), "expecting a valid expression after '{'"));
}

CCause EndOfField(const CFaultyLine& line) {
    if (!line.IsField()) return {};
    return line.Problem(ECode::kFieldExpression, line.At(), line.At(),
                        Joined(PrefixOf(line), "expecting '=', or '!', or ':', or '}'"));
}

}  // namespace codeloom
