#include "hints/type_hint_walker.h"

#include <algorithm>

#include "host/errors.h"
#include "host/restore.h"
#include "host/text.h"
#include "names/record_kinds.h"
#include "neighbours/strutils/text.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

// The comment tokens of a logical that hold "type:". Most logicals pay for this scan and no more.
int CountHintComments(CLogicalLine& logical) {
    const CRawToken* const tokens = logical.Tokens();
    const nb::object types = tokens == nullptr ? logical.GetTokTypes() : nb::none();
    int count = 0;
    for (Py_ssize_t i = 0; i < logical.fTokenCount; ++i) {
        const bool is_comment = tokens != nullptr
                                    ? tokens[i].type == kTokenId_COMMENT
                                    : TupleItem(types, i).equal(nb::int_(int{kTokenId_COMMENT}));
        if (is_comment && HoldsTypeMark(TupleItem(logical.GetToks(), i))) ++count;
    }
    return count;
}

// The entry of a dispatch dictionary for a visit: a plain function for the host, a direct call for us.
template <class NodeClass, auto operation>
CNativeVisit Visit() {
    return {
        nb::type<NodeClass>(),
        nb::cpp_function([](CTypeHintWalker& walker, NodeClass& node) { return (walker.*operation)(node); },
                         "walker"_a, "node"_a),
        [](CDispatchWalker& walker, CNode& node) {
            return (static_cast<CTypeHintWalker&>(walker).*operation)(*Instance<NodeClass>(node.Self()));
        }};
}

int SubExprCount(const CNodeRef& node) {
    CExpression* const expression = node->As<CExpression>();
    return expression == nullptr ? 0 : expression->GetSubExprCount();
}

CNodeRef SubExpr(const CNodeRef& node, int i) {
    return CNodeRef(CExpressionRef(Instance<CExpression>(node->Self()))->GetSubExpr(i).get());
}

}  // namespace

void CTypeHintWalker::Init(nb::object version_triple, nb::object grammar_file,
                           CRef<CNodeWalker> general_node_walker) {
    InitWithParser(NewInstance<CPGenParserImpl>(std::move(version_triple), std::move(grammar_file)),
                   std::move(general_node_walker));
}

void CTypeHintWalker::InitWithParser(CRef<CPGenParserImpl> hint_parser,
                                     CRef<CNodeWalker> general_node_walker) {
    nb::dict visits;
    visits[nb::type<CNameLiteral>()] = false;  // a leaf that can hold no hint
    InitWithVisits(visits, {Visit<CFuncdefStmt, &CTypeHintWalker::_VisitFuncdefStmt>(),
                            Visit<CExprStmt, &CTypeHintWalker::_VisitExprStmt>(),
                            Visit<CForStmt, &CTypeHintWalker::_VisitForStmt>(),
                            Visit<CWithStmt, &CTypeHintWalker::_VisitWithStmt>()});
    _fNameConv = NewInstance<CNodeToTextConverterImpl>();
    _fHintConv = NewInstance<CNodeToTextConverterImpl>(true, true);
    _fGeneralNodeWalker = std::move(general_node_walker);
    _fHintParser = std::move(hint_parser);
}

void CTypeHintWalker::Walk(CNodeRef node, CLogicalLine& logical, bool first_in_def) {
    const CRestoreOnExit counted(_fCommentHintCount, CountHintComments(logical));
    if (node) {
        CDispatchWalker::Walk(std::move(node), logical, first_in_def);
    } else if (_fCommentHintCount != 0) {
        _WalkLoneComment(logical, first_in_def);
    }
}

// A comment on a line of its own counts as the first line of a function's body alone.
void CTypeHintWalker::_WalkLoneComment(CLogicalLine& logical, bool first_in_def) {
    if (_fLogical) RaiseWalkInProgress();
    const CRestoreOnExit idle_logical(_fLogical, CRef<CLogicalLine>(&logical));
    const CFoundText found = _FindComment(0, CRef<CLogicalLine>(&logical));
    if (found.text.is_none()) return;
    const nb::object hint = _GetHintFromComment(nb::borrow<nb::str>(found.text));
    if (!hint.is_none() && first_in_def)
        _ProcessFuncdefComment(nb::borrow<nb::str>(hint), found.tok_i, nullptr, false);
}

// Visits

nb::object CTypeHintWalker::_VisitFuncdefStmt(CFuncdefStmt& node) {
    const CArgumentList args = GetDefiningArgInfoList(CNodeRef(node.GetParameters().get()));
    const CRestoreOnExit arg_comments(_fArgCommentCount, 0);
    const CArgument* last_without_hint = nullptr;
    for (const CArgument& arg : args) {
        const int taken = _fArgCommentCount;
        _VisitArgument(arg);
        const bool is_hinted = arg.type_expr || _fArgCommentCount != taken;
        last_without_hint = arg.name && !is_hinted ? &arg : nullptr;
    }
    _RecordHint(nb::str(kReturnName), CNodeRef(node.GetReturnType().get()), true);
    _ProcessEndingComment(node, last_without_hint);
    return nb::none();
}

void CTypeHintWalker::_VisitArgument(const CArgument& arg) {
    if (arg.is_tuple) return;
    if (arg.type_expr) {
        _ProcessNameAndHintNodes(arg.name, arg.type_expr, true);
    } else if (arg.name) {
        _ProcessArgSpecificComment(arg);
    }
}

nb::object CTypeHintWalker::_VisitForStmt(CForStmt& node) {
    if (_fCommentHintCount != 0) _ProcessTarget(node, node.GetTarget());
    return nb::bool_(false);
}

nb::object CTypeHintWalker::_VisitWithStmt(CWithStmt& node) {
    if (_fCommentHintCount == 0) return nb::bool_(false);
    const CWithItemList items = node.GetWithItems();
    for (Py_ssize_t i = 0; i < ListSize(items); ++i)
        _ProcessTarget(node, Instance<CWithItem>(ListItem(items, i))->GetTarget());
    return nb::bool_(false);
}

nb::object CTypeHintWalker::_VisitExprStmt(CExprStmt& node) {
    if (const CRef<CAnnotatedAssignNode> annotated = node.GetAnnotatedAssignNode())
        _ProcessNameAndHintNodes(node.GetInitialTestExpr(), annotated->GetTypeHintNode(), false);
    if (_fCommentHintCount != 0 && node.GetEqualCount() != 0) _ProcessTarget(node, node.GetInitialTestExpr());
    return nb::bool_(false);
}

// Names and hints

void CTypeHintWalker::_ProcessNameAndHintNodes(CNodeRef name_node, CNodeRef hint_node, bool is_arg) {
    if (!name_node || !hint_node) return;
    const int name_count = SubExprCount(name_node);
    if (name_count == 0) {
        const nb::object name = _fNameConv->TextForNode(*name_node, true);
        if (!name.is_none()) _RecordHint(name, hint_node, is_arg);
        return;
    }
    const CRecursionScope recursion;
    const int pair_count = std::min(name_count, SubExprCount(hint_node));
    for (int i = 0; i < pair_count; ++i)
        _ProcessNameAndHintNodes(SubExpr(name_node, i), SubExpr(hint_node, i), is_arg);
}

CBytesOrNone CTypeHintWalker::_GetHintInfoStr(CNodeRef node) {
    if (!node) return CBytesOrNone();
    std::string record(kTypeHintPrefix);
    CStringLiteral* const stringified = node->As<CStringLiteral>();
    const bool has_text = stringified == nullptr ? _fHintConv->AppendTextForNode(record, *node)
                                                 : AppendHostText(record, stringified->GetStringContents());
    return has_text ? CBytesOrNone(nb::bytes(record.data(), record.size())) : CBytesOrNone();
}

void CTypeHintWalker::_RecordHint(const nb::object& name, const CNodeRef& hint_node, bool is_arg) {
    const nb::object istr = _GetHintInfoStr(hint_node);
    if (!istr.is_none()) _AddSymInfo(name, istr, is_arg);
}

void CTypeHintWalker::_AddSymInfo(nb::object name, nb::object istr, bool is_arg) {
    const nb::object utf8_name = AsUtf8(name), record = AsUtf8(istr);
    if (is_arg) {
        _fLogical->AppendArgTypeEquiv(utf8_name, record);
    } else {
        _fLogical->AppendTypeEquiv(utf8_name, record);
    }
}

// Kept as hosts know it: "_" and "." fail like any other sign.
bool CTypeHintWalker::_IsDottedName(nb::bytes s) {
    const CUtf8 utf8(s);
    const std::string_view text = utf8;
    const auto is_letter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
    const auto is_digit = [](char c) { return c >= '0' && c <= '9'; };
    return text.empty() || (is_letter(text[0]) && std::all_of(text.begin(), text.end(), [&](char c) {
                                return is_letter(c) || is_digit(c);
                            }));
}

void BindTypeHintWalker(nb::module_& module) {
    nb::class_<CTypeHintWalker, CDispatchWalker, THostSubclass<CTypeHintWalker>> binding(
        module, "CTypeHintWalker", Collected<CTypeHintWalker>(),
        "Records the type hints of a logical line: annotations, and hints in comments.");
    binding
        .def(TInit<nb::object, nb::object, CRef<CNodeWalker>>(), "version_triple"_a.none(), "grammar_file"_a,
             "general_node_walker"_a.none())
        .def_ro("_fNameConv", &CTypeHintWalker::_fNameConv, "Gives the name text of a target.")
        .def_ro("_fHintConv", &CTypeHintWalker::_fHintConv, "Gives the text of a hint.")
        .def_ro("_fCommentHintCount", &CTypeHintWalker::_fCommentHintCount,
                "The comments of the logical being walked that hold \"type:\"; 0 between walks.")
        .def_ro("_fHintParser", &CTypeHintWalker::_fHintParser, "The parser for hint text.")
        .def_ro("_fGeneralNodeWalker", &CTypeHintWalker::_fGeneralNodeWalker,
                "Records the names that hints in comments use.");
    BindOperations(binding);
}

}  // namespace codeloom
