#include "tree/atom_nodes.h"

#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/text.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kObjectForStringLiteral("symbolinfo", "ObjectForStringLiteral");
constexpr std::string_view kStringPrefixLetters = "BFRUbfru";

// The prefix of a string literal, and what follows it.
struct CLiteralText {
    std::string_view prefix;
    std::string_view quoted;
};

CLiteralText SplitPrefix(std::string_view literal) {
    const size_t length = std::min(literal.find_first_not_of(kStringPrefixLetters), literal.size());
    return {literal.substr(0, length), literal.substr(length)};
}

// The quotes that a literal begins with: one or three; empty when it begins with something else.
std::string_view OpeningQuotes(std::string_view quoted) {
    if (quoted.empty()) RaiseIndexError("string index out of range");
    const char quote = quoted.front();
    if (quote != '"' && quote != '\'') return {};
    const bool is_triple = quoted.size() >= 3 && quoted[1] == quote && quoted[2] == quote;
    return quoted.substr(0, is_triple ? 3 : 1);
}

std::string_view WithoutQuotes(std::string_view quoted) {
    const std::string_view quotes = OpeningQuotes(quoted);
    if (quotes.empty()) return {};
    const size_t end = quoted.ends_with(quotes) ? quoted.size() - quotes.size() : quoted.size();
    return end <= quotes.size() ? std::string_view() : quoted.substr(quotes.size(), end - quotes.size());
}

// The value that a class of the host makes of `arguments`; none when it refuses them.
template <class... Arguments>
nb::object ConvertedOrNone(PyTypeObject& cls, const Arguments&... arguments) {
    try {
        return nb::borrow(reinterpret_cast<PyObject*>(&cls))(arguments...);
    } catch (const nb::python_error&) {
        return nb::none();
    }
}

}  // namespace

// CNumberLiteral

bool CNumberLiteral::IsFloat() {
    const CUtf8 text(fText);
    return text->find_first_of(".eE") != std::string_view::npos;
}

nb::object CNumberLiteral::GetNumericValue() {
    return IsFloat() ? ConvertedOrNone(PyFloat_Type, fText) : ConvertedOrNone(PyLong_Type, fText, 10);
}

// CStringLiteral

bool CStringLiteral::IsUnicode() {
    return _IsMarked('u', 'U');
}

bool CStringLiteral::IsBytes() {
    return _IsMarked('b', 'B');
}

bool CStringLiteral::_IsMarked(char lower, char upper) const {
    if (fText.is_none()) return false;
    const CUtf8 utf8(fText);
    std::string_view text = utf8;
    if (text.empty()) return false;
    if (text.front() == 'r' || text.front() == 'R') text.remove_prefix(1);
    if (text.empty()) RaiseIndexError("string index out of range");
    return text.front() == lower || text.front() == upper;
}

CTextOrNone CStringLiteral::GetStringContents() {
    const CUtf8 text(fText);
    return TextFromUtf8(WithoutQuotes(SplitPrefix(text).quoted));
}

nb::object CStringLiteral::GetStringValue() {
    const CUtf8 text(fText);
    const bool is_fstring = SplitPrefix(text).prefix.find_first_of("fF") != std::string_view::npos;
    return is_fstring ? nb::none() : kObjectForStringLiteral(fText);
}

// CAtom

CExpressionRef CAtom::GetSubExpr(int i) {
    if (GetSubExprCount() == 0) return CExpressionRef();
    const CRecursionScope recursion;  // brackets may be in brackets of any depth
    if (const CExpressionRef contents(TryChild<CExpression>(kContentsIndex)); contents)
        return i == 0 && contents->GetSubExprCount() == 0 ? contents : contents->GetSubExpr(i);
    if (const CRef<CListmakerNode> items(TryChild<CListmakerNode>(kContentsIndex)); items)
        return items->GetSubExpr(nb::int_(i));
    return CExpressionRef();
}

int CAtom::GetSubExprCount() {
    const nb::object bracket = GetInitialBracket();
    const bool may_hold_list = ChildCount() == kFilledChildCount && TextIsOneOf(bracket, "(", "[");
    if (!may_hold_list || !IsLiteral()) return 0;
    const CRecursionScope recursion;
    if (const CExpressionRef contents(TryChild<CExpression>(kContentsIndex)); contents) {
        const int count = contents->GetSubExprCount();
        return count == 0 && TextIs(bracket, "[") ? 1 : count;
    }
    const CRef<CListmakerNode> items(TryChild<CListmakerNode>(kContentsIndex));
    return items ? items->GetSubExprCount() : 0;
}

CTextOrNone CAtom::GetInitialBracket() {
    if (ChildCount() == 0) throw nb::value_error("Atom node with no children");
    const nb::object text = ChildAt(0).fText;
    return TextIsOneOf(text, "(", "[", "{") ? CTextOrNone(text) : CTextOrNone();
}

bool CAtom::IsLiteral() {
    return !IsComprehension();
}

bool CAtom::IsComprehension() {
    if (fChildren.Size() != kFilledChildCount) return false;
    const CNode& contents = ChildAt(kContentsIndex);
    // `a for b in c`, `a: b for c in d`
    return contents.TryChild<CCompForNode>(1) != nullptr || contents.TryChild<CCompForNode>(3) != nullptr;
}

bool CAtom::IsTwoPlusStringLiterals() {
    return false;
}

}  // namespace codeloom
