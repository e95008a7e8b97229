#include "extended/extended_forms.h"

#include <algorithm>

#include "host/errors.h"
#include "host/text.h"
#include "parse/syntax_error.h"
#include "text/token_type.h"
#include "tree/child_list.h"
#include "tree/expression_nodes.h"

namespace codeloom {

namespace {

constexpr int kVersionsOfMajor = 100;  // 3.12 is 312

template <class Class>
Py_ssize_t FindOfClass(const CNode& node) {
    for (Py_ssize_t i = 0; i < ListedCount(node); ++i)
        if (node.TryChild<Class>(i)) return i;
    return -1;
}

template <Py_ssize_t child_i>
Py_ssize_t Always(const CNode&) {
    return child_i;
}

template <Py_ssize_t child_i, class Class>
Py_ssize_t IfOfClass(const CNode& node) {
    return node.TryChild<Class>(child_i) ? child_i : -1;
}

Py_ssize_t FindSlash(const CNode& node) {
    for (Py_ssize_t i = 0; i < ListedCount(node); ++i)
        if (node.IsToken(i, "/")) return i;
    return -1;
}

Py_ssize_t FindNamedArgument(const CNode& node) {
    return node.IsToken(1, ":=") ? 1 : -1;
}

// In a set of one; the `:=` of `(x := 1)` has its brackets.
Py_ssize_t FindInBraces(const CNode& node) {
    return node.IsToken(0, "{") ? IfOfClass<1, CNamedExpr>(node) : -1;
}

// A comma list that holds a starred expression.
template <Py_ssize_t child_i>
Py_ssize_t FindStarInList(const CNode& node) {
    const CTestListStarExpr* const list = node.TryChild<CTestListStarExpr>(child_i);
    return list && FindOfClass<CStarExpression>(*list) != -1 ? child_i : -1;
}

int VersionOf(nb::handle version_triple) {
    if (!nb::isinstance<nb::tuple>(version_triple) || TupleSize(version_triple) < 2) return INT32_MAX;
    int major = 0, minor = 0;
    const bool is_read = nb::try_cast(TupleItem(version_triple, 0), major) &&
                         nb::try_cast(TupleItem(version_triple, 1), minor);
    constexpr int kMost = INT32_MAX / 2 / kVersionsOfMajor;
    return is_read ? std::clamp(major, 0, kMost) * kVersionsOfMajor + std::clamp(minor, 0, kMost) : INT32_MAX;
}

}  // namespace

const std::vector<CExtendedForms::CNodeForm>& CExtendedForms::_NodeForms() {
    static const std::vector<CNodeForm> node_forms = {
        {"annassign", forms::kVariableAnnotation, Always<0>},
        {"namedexpr_test", forms::kWalrus, Always<1>},
        {"argument", forms::kWalrus, FindNamedArgument},
        {"typedargslist", forms::kPositionalOnly, FindSlash},
        {"varargslist", forms::kPositionalOnly, FindSlash},
        {"return_stmt", forms::kStarInResult, FindStarInList<1>},
        {"yield_expr", forms::kStarInResult, FindStarInList<1>},
        {"for_stmt", forms::kStarInFor, FindStarInList<3>},
        {"trailer", forms::kWalrusInSubscript, IfOfClass<1, CNamedExpr>},
        {"subscriptlist", forms::kWalrusInSubscript, FindOfClass<CNamedExpr>},
        {"atom", forms::kWalrusInSet, FindInBraces},
        {"dictorsetmaker", forms::kWalrusInSet, FindOfClass<CNamedExpr>},
        {"star_test", forms::kStarInSubscript, Always<0>},
        {"fpdef", forms::kStarredAnnotation, IfOfClass<2, CStarExpression>},
        {"except_clause", forms::kBareExcept, IfOfClass<1, CTestListStarExpr>},
    };
    return node_forms;
}

void CExtendedForms::SetVersion(nb::handle version_triple) {
    _fVersion = VersionOf(version_triple);
    _Watch(kTokenId_STRING, nullptr);
    _Watch(kTokenId_NUMBER, nullptr);
}

void CExtendedForms::_Watch(int type, const CNodeForm* form) {
    if (type < 0) return;
    const size_t type_i = static_cast<size_t>(type);
    if (type_i >= _fWatched.size()) {
        _fWatched.resize(type_i + 1);
        _fNodeForm.resize(type_i + 1);
    }
    _fWatched[type_i] = true;
    _fNodeForm[type_i] = form;
}

void CExtendedForms::NoteNode(int type, const CNode& node) {
    if (type == kTokenId_STRING || type == kTokenId_NUMBER) {
        const CUtf8 text(node.fText);
        if (text->empty()) return;  // of a node that a host made
        const CForm* const form = type == kTokenId_STRING ? FormOfString(text) : FormOfNumber(text);
        if (form) Note(*form, node.fContext);
        return;
    }
    if (node.fChildren.IsNone()) return;
    const CNodeForm& node_form = *_fNodeForm[static_cast<size_t>(type)];
    const Py_ssize_t child_i = node_form.find(node);
    if (child_i >= 0) Note(node_form.form, node.ChildAt(child_i).fContext);
}

void CExtendedForms::Note(const CForm& form, nb::handle context) {
    if (_fFound || form.version <= _fVersion) return;
    _fFound = &form;
    _fContext = nb::borrow(context);
}

nb::object CExtendedForms::ErrorIn(CLogicalLine& logical) const {
    const CForm& found = *_fFound;
    const nb::object context = _fContext;
    const int major = found.version / kVersionsOfMajor, minor = found.version % kVersionsOfMajor;
    const nb::str message = found.version == CForm::kNone
                                ? nb::str("{} ended with Python 2").format(found.name)
                                : nb::str("{} needs Python {}.{}").format(found.name, major, minor);
    return CreateSyntaxError(message, logical.Self(), context, nb::none());
}

}  // namespace codeloom
