// Names that are read: alone, in chains, in calls, in comprehensions and decorators.
#include <algorithm>

#include "host/errors.h"
#include "host/restore.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "neighbours/symbolinfo/info_bytes.h"
#include "parse/syntax_error.h"
#include "strutils/text.h"
#include "symbolinfo/module_constants.h"
#include "tree/node_helpers.h"
#include "walker/node_walker.h"

namespace codeloom {

namespace {

bool IsValueName(const CNode& name) {
    return TextIsOneOf(name.fText, "None", "True", "False");
}

nb::object WithinExprEquiv(const CNode& name) {
    return Utf8Concat2(gPrefixes.kWithinExprPrefix,
                       BytesForInteger(ResultFromHost<Py_ssize_t>(name.fContext)));
}

// A lone `*a` is an argument whose record doesn't mention the star.
bool IsStarred(const CArgument& argument) {
    const CRef<CSingleUsedArgumentNode> single(argument.value->As<CSingleUsedArgumentNode>());
    return !argument.prefix.is_none() || (single && !single->GetPrefix().is_none());
}

}  // namespace

// Names

void CNodeWalker::_VisitNameLiteral(CNameLiteral& node, CNodeRef atom_node,
                                    std::optional<CNodeRange> all_trailers, int trailer_i) {
    if (IsValueName(node)) return;
    const Py_ssize_t count = Py_ssize_t{trailer_i} + 1;
    const bool more_follows = all_trailers && count < all_trailers->Size();
    const bool is_load = _fLoadNameContext || more_follows;
    if (!is_load && !_fStoreWithinSubExpr) return;
    CTextOrNone name = node.fText;
    if (all_trailers && trailer_i >= 0) {
        name = _NameInChain(*atom_node, *all_trailers, count);
        if (name.is_none()) return;
    }
    if (is_load) {
        _ProcessLoadName(name);
    } else {
        _fNames.AddStore(name, WithinExprEquiv(node));
    }
}

CTextOrNone CNodeWalker::_NameInChain(CNode& atom, const CNodeRange& trailers, Py_ssize_t count) {
    count = std::min(count, trailers.Size());
    CChainText* const visited = _fChainText;
    if (visited == nullptr || !visited->IsOf(atom, trailers))
        return CChainText(*_fToText, atom, trailers).UpTo(count);
    const CRestoreOnExit<CChainText*> busy(_fChainText,
                                           nullptr);  // while it grows, host code may come back here
    return visited->UpTo(count);
}

void CNodeWalker::_VisitDottedName(CDottedName& node) {
    nb::str name("");
    for (Py_ssize_t i = 0; i < node.fChildren.Size(); ++i) {
        name = nb::str(name + node.ChildAt(i).fText);
        if (i % 2 == 0) _ProcessLoadName(name);
    }
}

void CNodeWalker::_ProcessLoadName(CTextOrNone name) {
    _fNames.AddLoad(name);
}

// Chains

void CNodeWalker::_VisitPower(CPower& node) {
    const CChainParts parts = PartsOf(node);
    _VisitAtomPlusTrailers(*parts.atom, parts.trailers);
    if (const CNodeRef exponent = node.GetExponentNode()) _VisitNode(*exponent);
}

void CNodeWalker::_VisitAtomExpr(CAtomExpr& node) {
    const CChainParts parts = PartsOf(node);
    _VisitAtomPlusTrailers(*parts.atom, parts.trailers);
}

void CNodeWalker::_VisitAtomPlusTrailers(CNode& atom_node, const CNodeRange& all_trailers) {
    if (CNameLiteral* const name = atom_node.As<CNameLiteral>()) {
        _VisitNameLiteral(*name, CNodeRef(name), all_trailers, -1);
    } else {
        _VisitNode(atom_node);
    }
    CChainText chain_text(*_fToText, atom_node, all_trailers);
    const CRestoreOnExit visited(_fChainText, &chain_text);
    for (Py_ssize_t i = 0; i < all_trailers.Size(); ++i) _VisitTrailer(atom_node, all_trailers, i);
}

// Brackets without contents have the closing one as their second child, which records nothing.
void CNodeWalker::_VisitTrailer(CNode& atom_node, const CNodeRange& all_trailers, Py_ssize_t i) {
    const CRef<CTrailer> trailer = all_trailers.At<CTrailer>(i);
    const CTextOrNone token = trailer->GetInitialToken();
    const CNodeRef child = trailer->ChildAs<CNode>(1);
    if (TextIs(token, "(") && trailer->ChildCount() == 3) {
        _VisitCall(atom_node, all_trailers.First(i), *child);
    } else if (CNameLiteral* const name = TextIs(token, ".") ? child->As<CNameLiteral>() : nullptr) {
        _VisitNameLiteral(*name, CNodeRef(&atom_node), all_trailers, static_cast<int>(i));
    } else if (TextIsOneOf(token, "{", "[")) {
        _VisitLoadContextNode(*child);
    } else {
        _VisitNode(*child);
    }
}

// Calls

void CNodeWalker::_VisitCall(CNode& atom, const CNodeRange& prev_trailers, CNode& arglist) {
    CBytesOrNone func_name;
    const CChainParts called{CNodeRef(&atom), prev_trailers};
    if (IsDottedChain(called)) func_name = _TextForChain(called);
    _ProcessFunctionCall(std::move(func_name), GetUsedArgInfoList(CNodeRef(&arglist)));
}

void CNodeWalker::_ProcessFunctionCall(CBytesOrNone func_name, const CArgumentList& arg_list) {
    for (const CArgument& argument : arg_list) {
        if (arg_list.size() != 1) _RaiseIfBareGenerator(argument);
        _VisitNode(*argument.value);
    }
    if (func_name.is_none()) return;
    if (CUtf8(func_name) == "isinstance") _ProcessIsInstanceCall(arg_list);
    const CBytesOrNone arguments = _TextForArguments(arg_list);
    if (!arguments.is_none()) _AddTypeEquiv(func_name, Utf8Concat2(gPrefixes.kCalledPrefix, arguments));
}

void CNodeWalker::_RaiseIfBareGenerator(const CArgument& argument) {
    const CRef<CSingleUsedArgumentNode> single(argument.value->As<CSingleUsedArgumentNode>());
    if (!single || !single->IsUnparenthesizedGenExpr()) return;
    const nb::str message("Generator expression must be parenthesized if not sole argument");
    RaiseHostError(CreateSyntaxError(message, _fLogical.AsHost(), single->fContext, nb::none()));
}

// `(a,1)`; none when an argument has a name or a star, or no text.
CBytesOrNone CNodeWalker::_TextForArguments(const CArgumentList& arg_list) {
    std::string text = "(";
    for (const CArgument& argument : arg_list) {
        if (!argument.value || argument.name || IsStarred(argument)) return CBytesOrNone();
        if (&argument != &arg_list.front()) text += ',';
        if (!_fToText->AppendTextForNode(text, *argument.value)) return CBytesOrNone();
    }
    return CBytesOrNone(JoinUtf8({text, ")"}));
}

void CNodeWalker::_ProcessIsInstanceCall(const CArgumentList& arg_list) {
    if (arg_list.size() != 2) return;
    const CArgument& object = arg_list[0];
    const CArgument& classes = arg_list[1];
    if (!object.prefix.is_none() || object.name || !classes.prefix.is_none() || classes.name) return;
    const CBytesOrNone name = _DottedNameOf(*object.value);
    if (name.is_none()) return;
    for (const nb::object& instance_name : _InstanceNamesFor(*classes.value))
        _fLogical->AppendTypeEquiv(name, AsUtf8(instance_name));
}

std::vector<nb::object> CNodeWalker::_InstanceNamesFor(CNode& class_or_tuple) {
    std::vector<nb::object> names;
    const auto add = [&](CNode& node) {
        const CBytesOrNone name = _DottedNameOf(node);
        if (!name.is_none()) names.push_back(TextFromUtf8(GetInstanceNameForClass(CUtf8(name))));
    };
    add(class_or_tuple);
    if (!names.empty()) return names;
    for (const CNodeRef& element : ExpandSeqLiteral(class_or_tuple).value_or(std::vector<CNodeRef>()))
        if (element) add(*element);  // a generator has none
    return names;
}

// Comprehensions and decorators

void CNodeWalker::_VisitCompForNode(CCompForNode& node) {
    _VisitStoreContextNode(*node.GetTargetNode(), true);
    _VisitNode(*node.GetInNode());
    if (const CNodeRef next = node.GetCompIterNode()) _VisitNode(*next);
}

void CNodeWalker::_VisitSingleDecorator(CSingleDecorator& node) {
    const CNodeRef dotted = node.GetDottedName();
    _VisitNode(*dotted);
    const CArgumentList arg_list = node.GetUsedArgList();
    _ProcessFunctionCall(_TextForNode(*dotted), arg_list);
}

}  // namespace codeloom
