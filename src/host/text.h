// Text strings of the host from UTF-8 and back. Lone surrogates pass both ways in three bytes.
#pragma once

#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

nb::object TextFromUtf8(std::string_view utf8);

// The same as an interned string.
nb::object InternedText(std::string_view utf8);

// The UTF-8 bytes of a text or byte string, TypeError for anything else. They lie in the string itself, which
// the caller keeps alive; only for a text with lone surrogates they are made and kept here.
class CUtf8 {
  public:
    CUtf8() = default;
    explicit CUtf8(nb::handle text);

    operator std::string_view() const { return _fView; }
    bool operator==(std::string_view other) const { return _fView == other; }
    const std::string_view* operator->() const { return &_fView; }

  private:
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
