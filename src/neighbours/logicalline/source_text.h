// The text of a file, for as long as a logical line of it lives.
#pragma once

#include <memory>
#include <utility>

#include <nanobind/nanobind.h>

#include "host/text.h"

namespace codeloom {

// The host's own string, which isn't copied.
class CSourceText {
  public:
    explicit CSourceText(nb::str text) : _fText(std::move(text)), _fUtf8(_fText) {}

    std::string_view Utf8() const { return _fUtf8; }

  private:
    nb::str _fText;
    CUtf8 _fUtf8;
};

using CSourceTextRef = std::shared_ptr<const CSourceText>;

}  // namespace codeloom
