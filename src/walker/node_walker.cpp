#include "walker/node_walker.h"

#include "host/errors.h"
#include "host/restore.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "strutils/text.h"
#include "tree/node_helpers.h"
#include "walker/dispatch.h"

namespace codeloom {

void CNodeWalker::Init(nb::tuple version_triple) {
    _fPy3 = version_triple >= nb::make_tuple(3, 0);
    _fToText = MakeInstance<CNodeToTextConverterImpl>();
    _fToText->Init(_fIncludeExprText, _fIncludeExprText, _fIncludeExprText);
}

// The walk

void CNodeWalker::Walk(CNodeRef node, CLogicalLine& logical) {
    if (_fLogical) RaiseWalkInProgress();
    if (!node) return;
    _fLogical = CRef<CLogicalLine>(&logical);
    _fLoadNameContext = true;
    _fStoreWithinSubExpr = false;
    const CCallOnExit idle([this] {
        _fLogical.reset();
        _fVisits.Reset();
        _fRecurseCount = 0;
        _fNames.Clear();
    });
    RunLimited([&] {
        _VisitNode(*node);
        _ProcessNamesFound(*node);
    });
}

void CNodeWalker::_ProcessNamesFound(CNode& node) {
    if (node.As<CImportNamesStmt>() != nullptr || node.As<CFromImportStmt>() != nullptr) return;
    _fNames.VisitLoads([this](const nb::object& name) {
        HostAssert(!name.is_none());
        _AddTypeEquiv(name, gPrefixes.kGetPrefix);
    });
    _fNames.VisitStores([this](const nb::object& name, const nb::object& equiv) {
        HostAssert(!name.is_none());
        _AddTypeEquiv(name, equiv);
    });
}

void CNodeWalker::_VisitNode(CNode& node) {
    _fVisits.CountVisit();
    CVisitLimits::CheckDepth(++_fRecurseCount);  // left too high beyond the limit, which ends the walk
    const CCallOnExit up_again([this] { --_fRecurseCount; });
    VisitFor(node)(*this, node);
}

void CNodeWalker::_VisitChildren(CNode& node) {
    for (Py_ssize_t i = 0; i < node.fChildren.Size(); ++i) {
        const CNodeRef child(&node.fChildren.At(i));
        _VisitNode(*child);
    }
}

void CNodeWalker::_VisitStoreContextNode(CNode& node, bool within_sub_expr) {
    const CRestoreOnExit context(_fLoadNameContext, false);
    const CRestoreOnExit within(_fStoreWithinSubExpr, within_sub_expr);
    _VisitNode(node);
}

void CNodeWalker::_VisitLoadContextNode(CNode& node) {
    const CRestoreOnExit context(_fLoadNameContext, true);
    _VisitNode(node);
}

void CNodeWalker::_RaiseIfNotInstance(nb::handle node, nb::handle cls) {
    if (nb::cast<bool>(nb::module_::import_("builtins").attr("isinstance")(node, cls))) return;
    RaiseHost(PyExc_ValueError, nb::str("Node is not a {}: {}").format(nb::repr(cls), nb::repr(node)));
}

// Records

void CNodeWalker::_AddNameDefined(CTextOrUtf8 name) {
    _AddTypeEquiv(std::move(name), gPrefixes.kSetPrefix);
}

void CNodeWalker::_AddArgNameDefined(CTextOrUtf8 name) {
    _AddArgInfoBytes(std::move(name), gPrefixes.kSetPrefix);
}

void CNodeWalker::_AddTypeEquiv(CTextOrUtf8 name, CTextOrUtf8 equiv) {
    if (_fLogical) _fLogical->AppendTypeEquiv(AsUtf8(name), AsUtf8(equiv));
}

void CNodeWalker::_AddArgInfoBytes(CTextOrUtf8 name, CTextOrUtf8 ibytes) {
    if (_fLogical) _fLogical->AppendArgTypeEquiv(AsUtf8(name), AsUtf8(ibytes));
}

// Texts

CBytesOrNone CNodeWalker::_TextForNode(CNode& node, const CNodeTextOptions& options) {
    std::string text;
    if (!_fToText->AppendTextForNode(text, node, options)) return CBytesOrNone();
    return CBytesOrNone(JoinUtf8({text}));
}

CBytesOrNone CNodeWalker::_TextForChain(const CChainParts& chain) {
    std::string text;
    if (!_fToText->AppendTextForAtomPlusTrailers(text, *chain.atom, chain.trailers)) return CBytesOrNone();
    return CBytesOrNone(JoinUtf8({text}));
}

CBytesOrNone CNodeWalker::_DottedNameOf(CNode& node) {
    return IsDottedName(node) ? _TextForNode(node, {.dotted_name_only = true}) : CBytesOrNone();
}

namespace {

// Accessors of a field that hosts set by truth values.
template <bool CNodeWalker::* field>
bool Get(const CNodeWalker& walker) {
    return walker.*field;
}
template <bool CNodeWalker::* field>
void Set(CNodeWalker& walker, CTruth value) {
    walker.*field = value;
}

}  // namespace

void BindNodeWalker(nb::module_& module) {
    nb::class_<CNodeWalker, THostSubclass<CNodeWalker>> binding(
        module, "CNodeWalker", Collected<CNodeWalker>(), "Records what a logical line does with names.");
    binding.def(TInit<nb::tuple>(), "version_triple"_a)
        .def_prop_rw("_fIncludeExprText", Get<&CNodeWalker::_fIncludeExprText>,
                     Set<&CNodeWalker::_fIncludeExprText>,
                     "True when literals of numbers and strings are recorded with their text.")
        .def_prop_rw("_fIncludeOperatorExpressions", Get<&CNodeWalker::_fIncludeOperatorExpressions>,
                     Set<&CNodeWalker::_fIncludeOperatorExpressions>,
                     "False keeps _TypeEquivForOperatorExpression from giving anything.")
        .def_rw("_fMaxOperatorExpressionLength", &CNodeWalker::_fMaxOperatorExpressionLength,
                "Kept for hosts; the limit of 120 bytes doesn't follow it.")
        .def_prop_rw("_fPy3", Get<&CNodeWalker::_fPy3>, Set<&CNodeWalker::_fPy3>,
                     "True when the analysed language level is 3.0 or later.")
        .def_ro("_fToText", &CNodeWalker::_fToText,
                nb::for_getter(nb::sig("def _fToText(self) -> CNodeToTextConverterImpl")),
                "The converter for all text that is recorded.");
    BindOperations(binding);
}

}  // namespace codeloom
