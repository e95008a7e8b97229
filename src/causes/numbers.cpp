// A number that isn't one, or runs on: `1_`, `0x`, `0o8`, `9spam`, `0777`.

#include <string>

#include "causes/recognisers.h"
#include "tokenizer/number_lexer.h"

namespace codeloom {

namespace {

struct CBase {
    std::string_view name;
    std::string_view digits;
};

constexpr CBase BaseOf(char letter) {
    switch (letter) {
        case 'x':
            return {"hexadecimal", "0123456789abcdef"};
        case 'o':
            return {"octal", "01234567"};
        case 'b':
            return {"binary", "01"};
        default:
            return {"decimal", "0123456789"};
    }
}

bool HasLeadingZero(std::string_view number) {
    return number.size() > 1 && number[0] == '0' &&
           number.find_first_not_of("0123456789_") == std::string_view::npos &&
           number.find_first_not_of("0_") != std::string_view::npos &&
           number.find("__") == std::string_view::npos && number.back() != '_';
}

// What is wrong with the whole of a number, as written.
std::string WordsOfNumber(std::string_view number) {
    if (HasLeadingZero(number))
        return "leading zeros in decimal integer literals are not permitted; use an 0o prefix for octal "
               "integers";
    const char letter = number.size() > 1 && number[0] == '0' ? AsLower(number[1]) : '\0';
    const CBase base = BaseOf(letter);
    const auto is_digit = [&](size_t i) {
        return i < number.size() && base.digits.find(AsLower(number[i])) != std::string_view::npos;
    };
    size_t end = base.name == "decimal" ? 0 : 2;
    while (is_digit(end) || (ByteAt(number, end) == '_' && is_digit(end + 1))) ++end;
    if (ByteAt(number, end) == '_') ++end;
    if (base.name != "decimal" && IsDigit(ByteAt(number, end)))
        return Joined("invalid digit '", number.substr(end, 1), "' in ", base.name, " literal");
    if (base.name == "decimal") {
        const size_t number_end = NumberEnd(number, 0);
        if (number_end > 0 && AsLower(number[number_end - 1]) == 'j') return "invalid imaginary literal";
    }
    return Joined("invalid ", base.name, " literal");
}

bool MayRunOn(const CFaultyLine& line, int i) {
    const int type = line.Type(i);
    return line.IsAdjacent(i) && (type == kTokenId_NAME || type == kTokenId_NUMBER);
}

// The index after the tokens that the writer meant as one number; a sign after an exponent too.
int EndOfNumber(const CFaultyLine& line, int i) {
    int end = i + 1;
    for (;; ++end) {
        const bool is_exponent =
            AsLower(line.Text(end - 1).back()) == 'e' && line.Text(i).substr(0, 2) != "0x";
        const bool is_sign = line.Is(end, kTokenId_PLUS) || line.Is(end, kTokenId_MINUS);
        if (!MayRunOn(line, end) && !(is_exponent && is_sign && line.IsAdjacent(end))) return end;
    }
}

int StartOfNumber(const CFaultyLine& line, int i) {
    while (i > 0 && !line.Is(i, kTokenId_NUMBER) && MayRunOn(line, i)) --i;
    while (i > 0 && MayRunOn(line, i) && line.Is(i - 1, kTokenId_NUMBER)) --i;
    return i;
}

}  // namespace

CCause InvalidNumber(const CFaultyLine& line, int i) {
    const int start = StartOfNumber(line, i);
    if (!line.Is(start, kTokenId_NUMBER)) return {};
    const int end = EndOfNumber(line, start);
    if (end == start + 1) return {};
    const CRawToken& first = line.Token(start);
    const CRawToken& last = line.Token(end - 1);
    const std::string_view number =
        line.FileText().substr(first.start, last.start + last.length - first.start);
    std::string words = WordsOfNumber(number);
    if (words[0] == 'l') return line.Problem(ECode::kLeadingZeros, start, end - 1, std::move(words));
    const bool is_name = !IsDigit(number.back()) && number.find_first_of("._+-") == std::string_view::npos &&
                         number.substr(0, 1) != "0" && line.Text(end - 1).size() > 1;
    return line.Problem(ECode::kInvalidNumber, start, end - 1, std::move(words),
                        is_name ? "a name can't begin with a digit" : "");
}

}  // namespace codeloom
