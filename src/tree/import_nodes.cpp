#include "tree/import_nodes.h"

#include "host/text.h"
#include "tree/child_list.h"

namespace codeloom {

namespace {

void AppendLeafTexts(const CNode& node, nb::list& texts) {
    if (!node.fText.is_none()) return texts.append(node.fText);
    if (node.fChildren.IsNone()) return;
    const CRecursionScope recursion;
    for (Py_ssize_t i = 0; i < node.fChildren.Size(); ++i) AppendLeafTexts(node.ChildAt(i), texts);
}

nb::str Joined(const nb::list& texts) {
    static const CHostText kNothing("");
    return nb::str(nb::object(nb::handle(kNothing).attr("join")(texts)));
}

nb::str TextOf(const CNode& node) {
    nb::list texts;
    AppendLeafTexts(node, texts);
    return Joined(texts);
}

}  // namespace

// CImportNamesStmt, CFromImportStmt

CAsNameList CImportNamesStmt::GetAsNameList() {
    return _ProcessAsNamesList(ChildAs<CNode>(kNamesIndex));
}

CTextOrNone CFromImportStmt::GetFromString() {
    const Py_ssize_t import_i = _GetImportIndex();
    if (import_i <= kModuleIndex) return CTextOrNone();
    nb::list texts;
    for (Py_ssize_t i = kModuleIndex; i < import_i; ++i) AppendLeafTexts(ChildAt(i), texts);
    return Joined(texts);
}

bool CFromImportStmt::GetImportStar() {
    return ChildCount() >= 3 && ChildAt(-1).HasText("*");
}

CAsNameList CFromImportStmt::GetAsNameList() {
    const Py_ssize_t names_i = _GetImportIndex() + 1;
    const bool has_brackets = ChildAt(names_i).HasText("(");
    return _ProcessAsNamesList(ChildAs<CNode>(has_brackets ? names_i + 1 : names_i));
}

Py_ssize_t CFromImportStmt::_GetImportIndex() {
    static const CHostText kImport("import");
    return _GetMatchingChildToken(*this, nb::borrow<nb::str>(kImport));
}

Py_ssize_t _GetMatchingChildToken(const CNode& node, nb::str text) {
    if (node.fChildren.IsNone()) return -1;
    for (Py_ssize_t i = 0; i < node.fChildren.Size(); ++i) {
        const nb::object child_text = node.ChildAt(i).fText;
        if (child_text.equal(text)) return i;
    }
    return -1;
}

CAsNameList _ProcessAsNamesList(CNodeRef node) {
    CAsNameList names;
    if (node->ChildCount() < 2 || !node->ChildAt(1).HasText(",")) {
        names.append(_ProcessSingleModuleNameAs(node).Release());
        return names;
    }
    for (Py_ssize_t i = 0; i < ListedCount(*node); ++i) {
        const CNodeRef child = node->ChildAs<CNode>(i);
        if (!child->HasText(",")) names.append(_ProcessSingleModuleNameAs(child).Release());
    }
    return names;
}

CRef<CAsName> _ProcessSingleModuleNameAs(CNodeRef node) {
    CRef<CAsName> name = MakeInstance<CAsName>();
    const bool has_as = node && node->ChildCount() == 3 && node->IsToken(1, "as");
    name->module_name = TextOf(has_as ? node->ChildAt(0) : *node);
    if (has_as) name->as_name = node->ChildText(2);
    return name;
}

nb::str _TextForImportName(CNodeList node_list) {
    nb::list texts;
    for (Py_ssize_t i = 0; i < ListSize(node_list); ++i)
        AppendLeafTexts(*Instance<CNode>(ListItem(node_list, i)), texts);
    return Joined(texts);
}

void BindAsNames(nb::module_& module) {
    nb::class_<CAsName>(module, "CAsName", Collected<CAsName>(), "One imported name.")
        .def(TInit<>())
        .def_rw("module_name", &CAsName::module_name, "The name as written, with its dots.",
                nb::for_setter(nb::arg().none()))
        .def_rw("as_name", &CAsName::as_name, "The name after `as`; None without one.",
                nb::for_setter(nb::arg().none()));
    module.def("_GetMatchingChildToken", &_GetMatchingChildToken, "node"_a, "text"_a,
               "The index of the first child of `node` whose text is `text`; -1 when there is none.");
    module.def(
        "_ProcessAsNamesList", &_ProcessAsNamesList, "node"_a.none(),
        "A new list of CAsName, one for each name of a list, or the one of `node` itself when that isn't a "
        "list.");
    module.def("_ProcessSingleModuleNameAs", &_ProcessSingleModuleNameAs, "node"_a.none(),
               "The CAsName of `name as name` or of a name.");
    module.def("_TextForImportName", &_TextForImportName, "node_list"_a,
               "The texts of all leaves below the nodes, joined with nothing in between.");
}

}  // namespace codeloom
