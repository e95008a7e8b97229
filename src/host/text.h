// Text strings of the host from UTF-8 and back. Lone surrogates pass both ways in three bytes.
#pragma once

#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

nb::object TextFromUtf8(std::string_view utf8);

inline nb::bytes BytesFromUtf8(std::string_view utf8) {
    return nb::bytes(utf8.data(), utf8.size());
}

// The same as an interned string.
nb::object InternedText(std::string_view utf8);

// A text string, or none, as an object whose hash and comparison run no host code: an instance of a subclass
// is copied.
inline nb::object PlainText(nb::handle text) {
    if (text.is_none() || PyUnicode_CheckExact(text.ptr())) return nb::borrow(text);
    nb::object copy = nb::steal(PyUnicode_FromObject(text.ptr()));
    if (!copy.is_valid()) throw nb::python_error();
    return copy;
}

// The UTF-8 bytes of a text or byte string, TypeError for anything else. They lie in the string itself, which
// the caller keeps alive; only for a text with lone surrogates they are made and kept here.
class CUtf8 {
  public:
    CUtf8() = default;
    explicit CUtf8(nb::handle text) {
        if (PyUnicode_Check(text.ptr()) && PyUnicode_IS_COMPACT_ASCII(text.ptr())) {
            _fView = {static_cast<const char*>(PyUnicode_DATA(text.ptr())),
                      static_cast<size_t>(PyUnicode_GET_LENGTH(text.ptr()))};
        } else if (PyBytes_Check(text.ptr())) {
            _fView = {PyBytes_AS_STRING(text.ptr()), static_cast<size_t>(PyBytes_GET_SIZE(text.ptr()))};
        } else {
            _SetView(text);
        }
    }

    operator std::string_view() const { return _fView; }
    bool operator==(std::string_view other) const { return _fView == other; }
    const std::string_view* operator->() const { return &_fView; }

  private:
    void _SetView(nb::handle text);

    nb::object _fMade;
    std::string_view _fView;
};

// A text constant as an interned string, for the life of the process.
class CHostText {
  public:
    explicit CHostText(const char* text) : _fText(InternedText(text).release()) {}
    operator nb::handle() const { return _fText; }

  private:
    nb::handle _fText;
};

}  // namespace codeloom
