// Token texts as host strings. Most tokens of a file repeat, so the last ones made are kept by their bytes.
#pragma once

#include <array>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// A fixed number of strings, so that memory doesn't grow with the texts read.
class CTokenTexts {
  public:
    // The text string of a token. Names are interned, which lets a parser know its keywords by identity.
    nb::object Get(std::string_view token, bool is_name);

  private:
    static constexpr size_t kSlotCount = 8192;
    static constexpr size_t kMaxKeptLength = 32;

    struct CSlot {
        uint64_t hash = 0;
        nb::object text;
    };

    std::array<CSlot, kSlotCount> _fSlots;
};

}  // namespace codeloom
