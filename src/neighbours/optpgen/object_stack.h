// A stack of host objects.
#pragma once

#include <memory>
#include <new>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

class CObjectStack {
  public:
    CObjectStack() = default;
    CObjectStack(const CObjectStack&) = delete;
    CObjectStack& operator=(const CObjectStack&) = delete;
    ~CObjectStack() {
        Clear();
        std::allocator<nb::object>().deallocate(_fObjects, _fCapacity);
    }

    size_t Size() const { return _fSize; }
    nb::handle Top() const { return _fObjects[_fSize - 1]; }

    // Pushes what make() returns, an nb::object. It is made in its place, without a move.
    template <class Make>
    void Push(Make make) {
        if (_fSize == _fCapacity) [[unlikely]]
            _Grow();
        new (&_fObjects[_fSize]) nb::object(make());
        ++_fSize;
    }

    nb::handle At(size_t i) const { return _fObjects[i]; }

    nb::object Pop() { return Take(--_fSize); }

    // The object at `i`, which leaves its place empty. The place stays, until it is cut off.
    nb::object Take(size_t i) { return nb::steal(_fObjects[i].release()); }
    void CutOff(size_t first) { _fSize = first; }

    // The objects from `first` to the top as a new host list; they leave the stack.
    nb::object PopList(size_t first) {
        const auto count = static_cast<Py_ssize_t>(_fSize - first);
        nb::object list = nb::steal(PyList_New(count));
        if (!list.is_valid()) throw nb::python_error();
        for (Py_ssize_t i = 0; i < count; ++i)
            PyList_SET_ITEM(list.ptr(), i, Take(first + i).release().ptr());
        CutOff(first);
        return list;
    }

    // Dropping an object may run host code, and that the collector, so each leaves the stack first.
    void Clear() {
        while (_fSize > 0) Pop();
    }

    // For the collector, see binding.h.
    template <class Visitor>
    void VisitReferences(Visitor&& visit) {
        for (size_t i = 0; i < _fSize; ++i) visit(_fObjects[i]);
    }

  private:
    [[gnu::noinline]] void _Grow() {
        const size_t capacity = 2 * _fCapacity + 64;
        nb::object* const objects = std::allocator<nb::object>().allocate(capacity);
        std::uninitialized_move_n(_fObjects, _fSize, objects);
        std::allocator<nb::object>().deallocate(_fObjects, _fCapacity);
        _fObjects = objects;
        _fCapacity = capacity;
    }

    nb::object* _fObjects = nullptr;  // the first _fSize live, the others are raw memory
    size_t _fSize = 0;
    size_t _fCapacity = 0;
};

}  // namespace codeloom
