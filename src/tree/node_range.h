// Nodes that are side by side, without a list of their own: a run of a node's children, or of a list that
// the host gave. The host sees a new list.
#pragma once

#include <algorithm>

#include "tree/node.h"

namespace codeloom {

class CNodeRange {
  public:
    CNodeRange() = default;
    // Of the children of `parent`.
    CNodeRange(CNode& parent, Py_ssize_t start, Py_ssize_t end)
        : _fParent(&parent), _fStart(start), _fEnd(std::max(start, end)) {}
    // The whole of a list of the host.
    explicit CNodeRange(nb::list list) : _fList(list), _fEnd(ListSize(list)) {}

    Py_ssize_t Size() const { return _fEnd - _fStart; }

    // TypeError when the item isn't a T, IndexError when host code has shortened the list meanwhile.
    template <class T>
    CRef<T> At(Py_ssize_t i) const {
        if (_fParent) return _fParent->ChildAs<T>(_fStart + i);
        return CRef<T>(Instance<T>(ListItem(_fList, _fStart + i)));
    }

    CNodeRange First(Py_ssize_t count) const { return Between(0, count); }
    CNodeRange Between(Py_ssize_t start, Py_ssize_t end) const {
        CNodeRange part = *this;
        part._fStart = _fStart + start;
        part._fEnd = std::max(part._fStart, _fStart + end);
        return part;
    }

    // True for a range that begins at the same item of the same list.
    bool BeginsLike(const CNodeRange& other) const {
        return _fParent.get() == other._fParent.get() && _fList.is(other._fList) && _fStart == other._fStart;
    }

    nb::list AsList() const {
        if (Size() == 0) return nb::list();
        return ListSlice(_fParent ? _fParent->fChildren.AsHost() : _fList, _fStart, _fEnd);
    }

  private:
    CNodeRef _fParent;  // or
    nb::object _fList;
    Py_ssize_t _fStart = 0, _fEnd = 0;
};

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CNodeRange> {
    NB_TYPE_CASTER(codeloom::CNodeRange,
                   const_name("list[") + make_caster<codeloom::CNode>::Name + const_name("]"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        if (!PyList_Check(source.ptr())) return false;
        value = codeloom::CNodeRange(borrow<list>(source));
        return true;
    }

    static handle from_cpp(const codeloom::CNodeRange& source, rv_policy, cleanup_list*) {
        return source.AsList().release();
    }
};

}  // namespace nanobind::detail
