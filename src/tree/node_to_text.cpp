#include "tree/node_to_text.h"

#include "host/errors.h"
#include "host/text.h"
#include "names/encode_literal.h"
#include "names/join_tokens.h"
#include "neighbours/symbolinfo/info_bytes.h"
#include "tree/node_helpers.h"

namespace codeloom {

namespace {

bool IsName(const CNode& leaf) {
    return leaf.As<CNameLiteral>() != nullptr;
}

bool IsKeywordLiteral(nb::handle text) {
    return TextIsOneOf(text, "None", "True", "False");
}

bool AreAllStrings(CNode& node) {
    for (Py_ssize_t i = 0; i < node.fChildren.Size(); ++i)
        if (node.TryChild<CStringLiteral>(i) == nullptr) return false;
    return true;
}

}  // namespace

bool AppendHostText(std::string& text, const nb::object& host_text) {
    if (host_text.is_none()) return false;
    text += CUtf8(host_text);
    return true;
}

CBytesOrNone CNodeToTextConverter::TextForNode(CNode&, bool, bool, bool, bool) {
    return CBytesOrNone();
}

void CNodeToTextConverterImpl::Init(bool include_bracket_text, bool include_string_contents,
                                    bool include_arg_text) {
    _fIncludeBracketText = include_bracket_text;
    _fIncludeStringContents = include_string_contents;
    _fIncludeArgText = include_arg_text;
}

// The operations as the host calls them. Each works in a buffer of its own.

CBytesOrNone CNodeToTextConverterImpl::TextForNode(CNode& node, bool dotted_name_only,
                                                   bool discard_simple_parens, bool literal_only,
                                                   bool add_parens_if_operator) {
    std::string text;
    const CNodeTextOptions options{dotted_name_only, discard_simple_parens, literal_only,
                                   add_parens_if_operator};
    const bool has_text = CNodeToTextConverterImpl::AppendTextForNode(text, node, options);
    return has_text ? CBytesOrNone(BytesFromUtf8(text)) : CBytesOrNone();
}

nb::bytes CNodeToTextConverterImpl::_TextForStringLiteral(CStringLiteral& node) {
    std::string text;
    CNodeToTextConverterImpl::AppendTextForStringLiteral(text, node);
    return BytesFromUtf8(text);
}

CBytesOrNone CNodeToTextConverterImpl::TextForAtomPlusTrailers(CNode& atom, const CNodeRange& trailers,
                                                               bool dotted_name_only,
                                                               bool discard_simple_parens,
                                                               bool literal_only) {
    std::string text;
    const CNodeTextOptions options{dotted_name_only, discard_simple_parens, literal_only};
    const bool has_text =
        CNodeToTextConverterImpl::AppendTextForAtomPlusTrailers(text, atom, trailers, options);
    return has_text ? CBytesOrNone(BytesFromUtf8(text)) : CBytesOrNone();
}

// Nodes

bool CNodeToTextConverterImpl::AppendTextForNode(std::string& text, CNode& node,
                                                 const CNodeTextOptions& options) {
    const CRecursionScope recursion;
    const CNodeRef shown = options.discard_simple_parens ? DropSimpleParens(node) : CNodeRef(&node);
    if (!shown->fText.is_none()) return _AppendLeaf(text, *shown, options);
    if (CAtomExpr* const chain = shown->As<CAtomExpr>()) return _AppendChain(text, *chain, options);
    if (CPower* const power = shown->As<CPower>()) return _AppendChain(text, *power, options);
    CAtom* const atom = options.dotted_name_only ? nullptr : shown->As<CAtom>();
    return atom == nullptr ? _AppendJoinedChildren(text, *shown, options) : _AppendAtom(text, *atom, options);
}

bool CNodeToTextConverterImpl::_AppendLeaf(std::string& text, CNode& leaf, const CNodeTextOptions& options) {
    if (options.dotted_name_only && !IsName(leaf)) return false;
    if (options.literal_only && IsName(leaf) && !IsKeywordLiteral(leaf.fText)) return false;
    if (CStringLiteral* const literal = leaf.As<CStringLiteral>()) {
        AppendTextForStringLiteral(text, *literal);
        return true;
    }
    return AppendHostText(text, leaf.fText);
}

bool CNodeToTextConverterImpl::_AppendAtom(std::string& text, CAtom& atom, const CNodeTextOptions& options) {
    const nb::object bracket = atom.GetInitialBracket();
    if (!_fIncludeBracketText && TextIsOneOf(bracket, "{", "[")) {
        text += TextIs(bracket, "{") ? "{}" : "[]";
    } else if (AreAllStrings(atom)) {
        _AppendFirstString(text, atom);
    } else if (_fIncludeBracketText && TextIs(bracket, "(") && atom.ChildCount() == 2 &&
               atom.IsToken(1, ")")) {
        text += "( )";
    } else {
        return _AppendJoinedChildren(text, atom, options);
    }
    return true;
}

// Each of adjacent strings is converted; the first one stands for all.
void CNodeToTextConverterImpl::_AppendFirstString(std::string& text, CAtom& atom) {
    size_t end = text.size();
    for (Py_ssize_t i = 0; i < atom.fChildren.Size(); ++i) {
        AppendTextForStringLiteral(text, *atom.ChildAs<CStringLiteral>(i));
        if (i == 0) end = text.size();
    }
    text.resize(end);
}

// Whatever has no form of its own: the texts of its children, joined as tokens are.
bool CNodeToTextConverterImpl::_AppendJoinedChildren(std::string& text, CNode& node,
                                                     const CNodeTextOptions& options) {
    if (!_fIncludeBracketText || options.dotted_name_only || node.fChildren.IsNone()) return false;
    const Py_ssize_t child_count = node.fChildren.Size();
    const bool has_parens = options.add_parens_if_operator && child_count != 1;
    if (has_parens) text += '(';
    CTokenJoiner joiner;
    for (Py_ssize_t i = 0; i < child_count; ++i) {
        const CNodeRef child = node.ChildAs<CNode>(i);
        const size_t start = text.size();
        if (!AppendTextForNode(text, *child)) return false;
        joiner.PartFromPrevious(text, start);
    }
    if (has_parens) text += ')';
    return true;
}

// Chains

template <class Chain>
bool CNodeToTextConverterImpl::_AppendChain(std::string& text, Chain& chain,
                                            const CNodeTextOptions& options) {
    const CChainParts parts = PartsOf(chain);
    return AppendTextForAtomPlusTrailers(text, *parts.atom, parts.trailers, options);
}

bool CNodeToTextConverterImpl::AppendTextForAtomPlusTrailers(std::string& text, CNode& atom,
                                                             const CNodeRange& trailers,
                                                             const CNodeTextOptions& options) {
    // The parentheses of `(a).b` are no longer simple.
    const bool discard_simple_parens = options.discard_simple_parens && trailers.Size() == 0;
    const CNodeTextOptions atom_options{options.dotted_name_only, discard_simple_parens,
                                        options.literal_only};
    if (!AppendTextForNode(text, atom, atom_options)) return false;
    AppendTextForTrailers(text, trailers, options);
    return true;
}

void CNodeToTextConverterImpl::AppendTextForTrailers(std::string& text, const CNodeRange& trailers,
                                                     const CNodeTextOptions& options) {
    for (Py_ssize_t i = 0; i < trailers.Size(); ++i)
        if (!_AppendTrailer(text, *trailers.At<CTrailer>(i), options)) return;
}

// False for a trailer that ends a dotted name.
bool CNodeToTextConverterImpl::_AppendTrailer(std::string& text, CTrailer& trailer,
                                              const CNodeTextOptions& options) {
    const nb::object token = trailer.GetInitialToken();
    if (TextIs(token, ".")) {
        const nb::object name = trailer.GetDotName();
        if (!name.is_none()) AppendHostText(text += '.', name);
    } else if (options.dotted_name_only) {
        return false;
    } else if (TextIs(token, "(")) {
        _AppendNested(text, trailer, "()", _fIncludeArgText);
    } else if (TextIs(token, "[")) {
        _AppendNested(text, trailer, "[]", _fIncludeBracketText);
    } else {
        throw nb::value_error("Bad trailer node");
    }
    return true;
}

void CNodeToTextConverterImpl::_AppendNested(std::string& text, CTrailer& trailer, std::string_view brackets,
                                             bool with_contents) {
    text += brackets.front();
    const CNodeRef nested = with_contents ? trailer.GetNestedNode() : CNodeRef();
    const size_t start = text.size();
    if (nested && !AppendTextForNode(text, *nested)) text.resize(start);
    text += brackets.back();
}

// Strings

void CNodeToTextConverterImpl::AppendTextForStringLiteral(std::string& text, CStringLiteral& node) {
    const nb::object literal = node.fText;
    if (_fIncludeStringContents) {
        const CUtf8 utf8(literal);
        if (IsHarmlessLiteral(utf8)) {
            text += utf8;
            return;
        }
    }
    const bool is_bytes = _fIncludeStringContents && node.IsBytes();
    text += is_bytes ? "b''" : node.IsUnicode() ? "u''" : "''";
}

void BindNodeToText(nb::module_& module) {
    nb::class_<CNodeToTextConverter, THostSubclass<CNodeToTextConverter>> interface(
        module, "CNodeToTextConverter", Plain(),
        "What turns nodes into short texts; a host may derive its own.");
    interface.def(TInit<>());
    BindOperations(interface);

    nb::class_<CNodeToTextConverterImpl, CNodeToTextConverter, THostSubclass<CNodeToTextConverterImpl>>
        converter(module, "CNodeToTextConverterImpl", "Turns nodes into short texts, as names are recorded.");
    converter
        .def(TInit<bool, bool, bool>(), "include_bracket_text"_a = false, "include_string_contents"_a = false,
             "include_arg_text"_a = false, "Whether what is in brackets, in strings and in calls is shown.")
        .def_ro("_fIncludeArgText", &CNodeToTextConverterImpl::_fIncludeArgText,
                "True when the arguments of calls are shown.");
    BindOperations(converter);
}

}  // namespace codeloom
