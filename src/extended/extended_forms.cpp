#include "extended/extended_forms.h"

#include <algorithm>

#include "host/errors.h"
#include "host/text.h"
#include "parse/syntax_error.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

constexpr int kVersionsOfMajor = 100;  // 3.12 is 312

int VersionOf(nb::handle version_triple) {
    if (!nb::isinstance<nb::tuple>(version_triple) || TupleSize(version_triple) < 2) return INT32_MAX;
    int major = 0, minor = 0;
    const bool is_read = nb::try_cast(TupleItem(version_triple, 0), major) &&
                         nb::try_cast(TupleItem(version_triple, 1), minor);
    constexpr int kMost = INT32_MAX / 2 / kVersionsOfMajor;
    return is_read ? std::clamp(major, 0, kMost) * kVersionsOfMajor + std::clamp(minor, 0, kMost) : INT32_MAX;
}

}  // namespace

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
    const Py_ssize_t child_i = node_form.find(CHostedFormNode(node));
    if (child_i >= 0) Note(*node_form.form, node.ChildAt(child_i).fContext);
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
