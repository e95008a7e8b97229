// The search for bytes outside brackets and strings, as an object that keeps alive what it searches.
#pragma once

#include <nanobind/nanobind.h>

#include "_fastaccess/non_nested.h"
#include "host/hosted.h"
#include "host/text.h"

namespace codeloom {

class CNonNestedSearch : public CHosted {
  public:
    void Init() {}

    // Searches the UTF-8 form of a text string, or a byte string, from byte `start` up to `end` for
    // `to_find_bytes`. Anything else leaves the search idle. 0, or -1 on failure, which leaves it idle too: a
    // TypeError for a subclass of either, otherwise as InitNonNestedStruct.
    int InitWith(nb::handle to_search, nb::handle to_find_bytes, Py_ssize_t start, Py_ssize_t end);

    // The same for any byte or text string; none leaves the search idle.
    int InitStruct(const nb::object& to_search, nb::handle to_find_bytes, Py_ssize_t start, Py_ssize_t end);

    // The next hit, -1 when there is none; -2 on failure.
    Py_ssize_t FindNextInStruct() { return FindNextNonNestedStruct(_fSearch); }

    // The next hit, -1 when there is none left, which makes the search idle; -2 on failure.
    Py_ssize_t FindNext() {
        if (_fSearched.is_none()) return -1;
        const Py_ssize_t found = FindNextInStruct();
        if (found == -1) Clear();
        return found;
    }

    // Makes the search idle and lets go of what it searched.
    void Clear() {
        _fSearch = {};
        _fSearched = nb::none();
        _fToFind = nb::none();
        _fText = {};
    }

    const tNonNestedStruct& Search() const { return _fSearch; }

  private:
    tNonNestedStruct _fSearch;
    nb::object _fSearched = nb::none();  // the string searched; none when idle
    nb::object _fToFind = nb::none();
    CUtf8 _fText;
};

inline int CNonNestedSearch::InitWith(nb::handle to_search, nb::handle to_find_bytes, Py_ssize_t start,
                                      Py_ssize_t end) {
    const bool is_text = PyBytes_Check(to_search.ptr()) || PyUnicode_Check(to_search.ptr());
    if (is_text && !PyBytes_CheckExact(to_search.ptr()) && !PyUnicode_CheckExact(to_search.ptr())) {
        Clear();
        PyErr_Format(PyExc_TypeError, "expected bytes or str itself, %s found",
                     Py_TYPE(to_search.ptr())->tp_name);
        return -1;
    }
    return InitStruct(is_text ? nb::borrow(to_search) : nb::none(), to_find_bytes, start, end);
}

inline int CNonNestedSearch::InitStruct(const nb::object& to_search, nb::handle to_find_bytes,
                                        Py_ssize_t start, Py_ssize_t end) {
    Clear();
    CUtf8 text = to_search.is_none() ? CUtf8() : CUtf8(to_search);
    tNonNestedStruct search;
    if (InitNonNestedStruct(search, text->data(), to_find_bytes, start, end) != 0) return -1;
    if (to_search.is_none()) return 0;
    if (start < 0 || end > static_cast<Py_ssize_t>(text->size())) {
        PyErr_SetString(PyExc_ValueError, "start and end must lie within the text searched");
        return -1;
    }
    _fSearch = search;
    _fSearched = to_search;
    _fToFind = nb::borrow(to_find_bytes);
    _fText = std::move(text);
    return 0;
}

}  // namespace codeloom
