// The children of one node. They are native until the host asks for the list; from then on the list counts,
// which the host may change as it likes.
#pragma once

#include <iterator>
#include <utility>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/collections.h"
#include "host/errors.h"
#include "host/hosted.h"

namespace codeloom {

template <class Node>
class TChildren {
  public:
    TChildren() = default;
    TChildren(const TChildren&) = delete;
    TChildren& operator=(const TChildren&) = delete;
    ~TChildren() {
        if (!_fNodes.empty()) _DropInLoop(std::move(_fNodes));
        if (_HasList()) _DropInLoop(std::move(_fList));
    }

    // True for those of a leaf, which the host sees as none.
    bool IsNone() const { return _fIsNone; }

    Py_ssize_t Size() const {
        return _HasList() ? ListSize(_fList) : static_cast<Py_ssize_t>(_fNodes.size());
    }

    // A negative index counts from the end. For one outside of the children it is IndexError, and TypeError
    // when there are none.

    // The child at `i`, borrowed; TypeError when it isn't a node.
    Node& At(Py_ssize_t i) const {
        if (_HasList()) [[unlikely]]
            return *Instance<Node>(ListItem(_fList, i));
        return *_fNodes[_IndexOf(i)];
    }

    // The child at `i`, borrowed; null when it isn't a node.
    Node* TryAt(Py_ssize_t i) const {
        if (_HasList()) [[unlikely]]
            return TryInstance<Node>(ListItem(_fList, i));
        return _fNodes[_IndexOf(i)].get();
    }

    // The child at `i` as a T, empty when it is None; TypeError when it is of another class.
    template <class T>
    CRef<T> RefAt(Py_ssize_t i) const {
        if (_HasList()) [[unlikely]]
            return CRef<T>::FromHost(ListItem(_fList, i));
        Node& node = At(i);
        T* const found = node.template As<T>();
        if (found == nullptr) RaiseWrongType(nb::type_name(nb::type<T>()).c_str(), node.Self());
        return CRef<T>(found);
    }

    // The host's view: the list, or none.
    nb::object AsHost() {
        if (_fIsNone) return nb::none();
        if (_HasList()) return _fList;
        const CNoCollection steady;
        nb::object list = nb::steal(PyList_New(Size()));
        if (!list.is_valid()) throw nb::python_error();
        Py_ssize_t i = 0;
        for (CRef<Node>& node : _fNodes) PyList_SET_ITEM(list.ptr(), i++, node.Release().release().ptr());
        _fNodes.clear();
        _fList = list;
        return list;
    }

    // The list that the host has; invalid unless it has asked for one.
    const nb::object& ListOfHost() const { return _fList; }

    // Gives each native child to take(child), or else the host's list to the caller, and is those of a leaf
    // afterwards. It drops nothing, so that no host code runs, unless `take` does.
    template <class Take>
    nb::object TakeAll(Take take) {
        for (CRef<Node>& node : _fNodes) take(std::move(node));
        _fNodes.clear();  // of places without a node
        if (_fNodes.capacity() > kMostKept) std::vector<CRef<Node>>().swap(_fNodes);
        _fIsNone = true;
        return std::move(_fList);
    }

    void SetNone() {
        _fIsNone = true;
        DropEach(_fNodes);
        if (_fNodes.capacity() > kMostKept) std::vector<CRef<Node>>().swap(_fNodes);
        const nb::object dropped = std::move(_fList);
    }

    // Takes over a list of the host, or none.
    void SetList(nb::object list_or_none) {
        SetNone();
        if (list_or_none.is_none()) return;
        _fList = std::move(list_or_none);
        _fIsNone = false;
    }

    // Takes over `count` nodes, which take(i) gives.
    template <class Take>
    void SetNodes(size_t count, Take take) {
        SetNone();
        _fNodes.reserve(count);
        for (size_t i = 0; i < count; ++i) _fNodes.push_back(take(i));
        _fIsNone = false;
    }

    void Append(CRef<Node> node) {
        if (!_HasList()) return _fNodes.push_back(std::move(node));
        if (PyList_Append(_fList.ptr(), node.AsHost().ptr()) != 0) throw nb::python_error();
    }

    // Takes the child at `i` out.
    CRef<Node> Remove(Py_ssize_t i) {
        CRef<Node> node(&At(i));
        if (_HasList()) {
            DeleteListItem(_fList, i);
        } else {
            _fNodes.erase(std::next(_fNodes.begin(), static_cast<Py_ssize_t>(_IndexOf(i))));
        }
        return node;
    }

    // For the collector, see binding.h. Once it has cleared the references there are no children.
    template <class Visitor>
    void VisitReferences(Visitor&& visit) {
        for (size_t i = 0; i < _fNodes.size(); ++i) visit(_fNodes[i]);
        if (_HasList()) visit(_fList);
        const bool is_cleared = _HasList() ? _fList.is_none() : !_fNodes.empty() && !_fNodes.back();
        if (is_cleared) SetNone();
    }

  private:
    static constexpr size_t kMostKept = 64;  // places that a free node keeps for its next children

    bool _HasList() const { return _fList.is_valid(); }

    size_t _IndexOf(Py_ssize_t i) const {
        const auto size = static_cast<Py_ssize_t>(_fNodes.size());
        if (i < 0) i += size;
        if (i < 0 || i >= size) [[unlikely]]
            _RaiseOutside();
        return static_cast<size_t>(i);
    }

    [[noreturn]] void _RaiseOutside() const {
        if (_fIsNone) RaiseHost(PyExc_TypeError, "'NoneType' object is not subscriptable");
        RaiseIndexError("list index out of range");
    }

    // A deep tree is dropped in a loop: by recursion it would overflow the stack. That holds for the host's
    // lists too, whose own drop goes as deep as a main thread's stack allows on 3.13.
    template <class Children>
    static void _DropInLoop(Children children) {
        static std::vector<Children> waiting;
        static bool is_dropping = false;
        waiting.push_back(std::move(children));
        if (is_dropping) return;
        is_dropping = true;
        while (!waiting.empty()) {
            const Children dropped = std::move(waiting.back());
            waiting.pop_back();
        }
        is_dropping = false;
    }

    std::vector<CRef<Node>> _fNodes;  // empty once there is a list
    nb::object _fList;                // invalid until the host asks
    bool _fIsNone = true;
};

}  // namespace codeloom
