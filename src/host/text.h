// Text strings of the host from UTF-8. Lone surrogates, which a host text may hold, pass both ways in three
// bytes.
#pragma once

#include <string>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

nb::object TextFromUtf8(std::string_view utf8);

// The same as an interned string.
nb::object InternedText(std::string_view utf8);

// The UTF-8 form of a text string, with lone surrogates in three bytes: a view into the text itself where it
// has none, else into `storage`.
std::string_view Utf8OfText(nb::handle text, std::string& storage);

// The UTF-8 form of a text or byte string while this object lives, for texts that may hold lone surrogates.
class CUtf8 {
  public:
    explicit CUtf8(nb::handle text) : _fView(_ViewOf(text)) {}
    CUtf8(const CUtf8&) = delete;
    CUtf8& operator=(const CUtf8&) = delete;

    operator std::string_view() const { return _fView; }
    bool operator==(std::string_view other) const { return _fView == other; }
    const std::string_view* operator->() const { return &_fView; }

  private:
    std::string_view _ViewOf(nb::handle text);

    std::string _fStorage;
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
