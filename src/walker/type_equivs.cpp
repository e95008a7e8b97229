// What a value stands for: a typed literal, the text of a name or chain, the text of an expression. None
// where that isn't known, which writes no record.
#include "host/errors.h"
#include "host/restore.h"
#include "host/text.h"
#include "names/encode_literal.h"
#include "neighbours/imported_names.h"
#include "neighbours/symbolinfo/info_bytes.h"
#include "strutils/text.h"
#include "symbolinfo/module_constants.h"
#include "symbolinfo/vocabulary.h"
#include "tree/node_helpers.h"
#include "walker/node_walker.h"

namespace codeloom {

namespace {

constexpr size_t kMaxExpressionLength = 120;  // bytes, without a trailer

bool StartsWith(const nb::object& equiv, nb::handle prefix) {
    return CUtf8(equiv)->starts_with(CUtf8(prefix));
}

// A number and the plus or minus before it.
struct CSignedNumber {
    CRef<CNumberLiteral> number;  // empty for any other node
    CTextOrNone sign;
};

CSignedNumber SignedNumber(CFactorExpr& factor) {
    CTextOrNone sign = factor.GetUnaryOperator();
    const CNodeRef child = factor.GetChild(1);
    if (!child || !TextIsOneOf(sign, "+", "-")) return {};
    return {CRef<CNumberLiteral>(child->As<CNumberLiteral>()), std::move(sign)};
}

// Leaves but names. No part of one is known.
bool IsLiteral(const CNode& node) {
    return node.As<CNumberLiteral>() != nullptr || node.As<CStringLiteral>() != nullptr ||
           TextIsOneOf(node.fText, "None", "True", "False");
}

CBytesOrNone WithTrailer(CBytesOrNone text, const CBytesOrNone& extra_trailer) {
    if (text.is_none() || extra_trailer.is_none()) return text;
    return Utf8Concat2(text, extra_trailer);
}

// `equiv` without its prefix and type, where it is a literal that shows its value.
nb::object ValueOfLiteral(nb::object equiv) {
    if (!StartsWith(equiv, gPrefixes.kTypedLiteralPrefix)) return equiv;
    constexpr std::string_view kValueMark = ": ";
    const CUtf8 utf8(equiv);
    const size_t mark = utf8->find(kValueMark, kPrefixLen);
    const bool has_value = mark != std::string_view::npos && mark + kValueMark.size() < utf8->size();
    return has_value ? JoinUtf8({utf8->substr(mark + kValueMark.size())}) : equiv;
}

}  // namespace

CBytesOrNone CNodeWalker::_TypeEquivForNode(CNode& node, CBytesOrNone extra_trailer) {
    if (!extra_trailer.is_none() && CUtf8(extra_trailer)->empty()) extra_trailer = CBytesOrNone();
    const bool has_trailer = !extra_trailer.is_none();
    if (CAtom* const atom = node.As<CAtom>()) return _EquivForAtom(*atom, extra_trailer);
    if (CTestListStarExpr* const list = node.As<CTestListStarExpr>(); list != nullptr && list->IsTuple())
        return has_trailer ? CBytesOrNone() : _EquivForTuple(*list);
    if (CFactorExpr* const factor = node.As<CFactorExpr>()) {
        const CSignedNumber found = SignedNumber(*factor);
        if (found.number) return has_trailer ? CBytesOrNone() : _EquivForNumber(*found.number, found.sign);
    }
    if (IsLiteral(node)) return has_trailer ? CBytesOrNone() : _EquivForLiteral(node);
    if (CPower* const power = node.As<CPower>()) {
        if (power->GetExponentNode()) return CBytesOrNone();
        return WithTrailer(_TextForChain(PartsOf(*power)), extra_trailer);
    }
    if (CAtomExpr* const chain = node.As<CAtomExpr>())
        return WithTrailer(_TextForChain(PartsOf(*chain)), extra_trailer);
    if (node.As<COperatorExpression>() != nullptr || node.As<CFactorExpr>() != nullptr)
        return _EquivForOperators(node, extra_trailer);
    return WithTrailer(_DottedNameOf(node), extra_trailer);
}

// Brackets, and adjacent strings.
CBytesOrNone CNodeWalker::_EquivForAtom(CAtom& atom, const CBytesOrNone& extra_trailer) {
    const CTextOrNone bracket = atom.GetInitialBracket();
    const bool has_trailer = !extra_trailer.is_none();
    if (TextIs(bracket, "(") && (_fInnerGrouping == &atom || !IsTupleLiteralNode(atom)))
        return _EquivForGrouping(atom, extra_trailer);
    if (!bracket.is_none()) return has_trailer ? CBytesOrNone() : _EquivForDisplay(atom, bracket);
    if (atom.IsTwoPlusStringLiterals()) {
        if (has_trailer) return CBytesOrNone();
        return _InstanceNameForString(*CRef<CStringLiteral>::FromHost(atom.GetChild(0).AsHost()));
    }
    const CBytesOrNone text = _TextForNode(atom);
    if (text.is_none() && has_trailer)
        RaiseHost(PyExc_TypeError, "an atom without text can't be followed by a trailer");
    return WithTrailer(text, extra_trailer);
}

CBytesOrNone CNodeWalker::_EquivForDisplay(CAtom& atom, nb::handle bracket) {
    const bool is_tuple = TextIs(bracket, "(");
    const std::string_view type_name = is_tuple               ? "tuple"
                                       : TextIs(bracket, "[") ? "list"
                                       : IsSetLiteral(atom)   ? "set"
                                                              : "dict";
    return BuildLiteralInfo(type_name, _TextForNode(atom, {.literal_only = !is_tuple}));
}

// Parentheses that aren't a tuple's are looked through.
CBytesOrNone CNodeWalker::_EquivForGrouping(CAtom& atom, const CBytesOrNone& extra_trailer) {
    const CRecursionScope recursion;
    if (atom.ChildCount() == CAtom::kFilledChildCount) {
        const CNodeRef contents = atom.ChildAs<CNode>(CAtom::kContentsIndex);
        const CRestoreOnExit<const CNode*> inner_grouping(_fInnerGrouping, contents.get());
        return _TypeEquivForNode(*contents, extra_trailer);
    }
    HostAssert(false, [&]() -> nb::object { return _TextForNode(atom, {.literal_only = true}); });
    return CBytesOrNone();
}

CBytesOrNone CNodeWalker::_EquivForTuple(CTestListStarExpr& tuple) {
    const CBytesOrNone text = _TextForNode(tuple);
    if (text.is_none()) return BuildLiteralInfo("tuple", text);
    const CUtf8 utf8(text);
    const std::string_view elements = utf8->empty() ? " " : std::string_view(utf8);
    return BuildLiteralInfo("tuple", JoinUtf8({"(", elements, ")"}));
}

CBytesOrNone CNodeWalker::_EquivForLiteral(CNode& node) {
    if (TextIs(node.fText, "None")) return BuildLiteralInfo("None", node.fText);
    if (TextIsOneOf(node.fText, "True", "False"))
        return Utf8Concat3(gPrefixes.kTypedLiteralPrefix, nb::bytes("bool: "), node.fText);
    if (CNumberLiteral* const number = node.As<CNumberLiteral>()) return _EquivForNumber(*number);
    return _EquivForString(*node.As<CStringLiteral>());
}

CBytesOrNone CNodeWalker::_EquivForNumber(CNumberLiteral& number, const CTextOrNone& sign) {
    const std::string_view type_name = number.IsFloat() ? "float" : "int";
    if (!_fIncludeExprText || number.fText.is_none()) return BuildLiteralInfo(type_name, nb::none());
    return BuildLiteralInfo(type_name, Utf8Concat2(sign, number.fText));
}

CBytesOrNone CNodeWalker::_EquivForString(CStringLiteral& literal) {
    CBytesOrNone instance_name = _InstanceNameForString(literal);
    if (!_fIncludeExprText) return instance_name;
    std::string storage;
    const CUtf8 text(literal.fText);
    return JoinUtf8({CUtf8(instance_name), " ", EncodeStringLiteral(text, storage)});
}

CBytesOrNone CNodeWalker::_InstanceNameForString(CStringLiteral& literal) {
    if (literal.IsBytes()) return nb::borrow(gInstanceNames.kBytesInstanceName);
    const bool is_unicode = literal.IsUnicode() && !_fPy3;
    return nb::borrow(is_unicode ? gInstanceNames.kUnicodeInstanceName : gInstanceNames.kStringInstanceName);
}

CBytesOrNone CNodeWalker::_EquivForOperators(CNode& node, const CBytesOrNone& extra_trailer) {
    std::string text;
    const bool has_trailer = !extra_trailer.is_none();
    const bool has_text = _fToText->AppendTextForNode(text, node, {.add_parens_if_operator = has_trailer});
    if (!has_text || text.size() > kMaxExpressionLength) return CBytesOrNone();
    return Utf8Concat3(gPrefixes.kExpressionEquivPrefix, JoinUtf8({text}), extra_trailer);
}

// What attaches an equiv to a name

// An assignment to `x[i]` defines nothing, yet its value is recorded under that text.
void CNodeWalker::_AppendEquivNode(CNode& name_node, CNodeRef equiv_node, CBytesOrNone extra_trailer) {
    const CBytesOrNone name = _TextForNode(name_node);
    if (name.is_none()) return;
    if (CUtf8(name)->find('[') == std::string_view::npos) _AddNameDefined(name);
    if (!equiv_node) return;
    const CBytesOrNone equiv = _TypeEquivForNode(*equiv_node, std::move(extra_trailer));
    if (!equiv.is_none()) _AddTypeEquiv(name, equiv);
}

void CNodeWalker::_AddNodeInfoStr(CNode& name_node, CTextOrUtf8OrNone istr) {
    if (istr.is_none() || CUtf8(istr)->empty()) return;
    const CBytesOrNone name = _TextForNode(name_node);
    if (!name.is_none()) _AddTypeEquiv(name, istr);
}

// For hosts; nothing here calls the following two.

void CNodeWalker::_AppendSubscriptedEquivNode(CNode& name_node, CNodeRef equiv_node, Py_ssize_t subscript) {
    const CBytesOrNone name = _TextForNode(name_node);
    if (name.is_none()) return;
    _AddNameDefined(name);
    if (!equiv_node) return;
    nb::object equiv = _TypeEquivForNode(*equiv_node);
    if (equiv.is_none() || StartsWith(equiv, gPrefixes.kTypedLiteralPrefix)) return;
    if (StartsWith(equiv, gPrefixes.kExpressionEquivPrefix)) {
        const CUtf8 expression(equiv);
        equiv = JoinUtf8({expression->substr(0, kPrefixLen), "(", expression->substr(kPrefixLen), ")"});
    }
    const nb::object position = subscript == -1
                                    ? JoinUtf8({kIterationSubscript})
                                    : Utf8Concat3(nb::bytes("["), BytesForInteger(subscript), nb::bytes("]"));
    equiv = Utf8Concat2(equiv, position);
    _AddTypeEquiv(name, equiv);
}

CBytesOrNone CNodeWalker::_TypeEquivForOperatorExpression(COperatorExpression& op_expr) {
    const int count = op_expr.GetTermCount();
    if (!_fIncludeOperatorExpressions || count == 0) return CBytesOrNone();
    const bool is_unary = count == 1;
    const CTextOrNone sign = is_unary ? op_expr.GetOperatorStr(0) : CTextOrNone();
    nb::list parts;
    for (int term_i = 0; term_i < count; ++term_i) {
        if (is_unary || term_i != 0) {
            const CTextOrNone op = op_expr.GetOperatorStr(is_unary ? 0 : term_i - 1);
            if (op.is_none()) return CBytesOrNone();
            parts.append(AsUtf8(op));
        }
        const CBytesOrNone equiv = _TypeEquivForNode(*op_expr.GetTerm(term_i));
        if (equiv.is_none()) return CBytesOrNone();
        parts.append(ValueOfLiteral(equiv));
    }
    const bool is_signed_number = TextIsOneOf(sign, "+", "-") && op_expr.GetTerm(0)->As<CNumberLiteral>();
    return nb::object(nb::bytes(is_signed_number ? "" : " ").attr("join")(parts));
}

}  // namespace codeloom
