// Which texts are keys of a dictionary of the host. Most that aren't are known by their first character and
// their length, without a question to the dictionary.
#pragma once

#include <array>
#include <cstdint>

#include <nanobind/nanobind.h>

#include "host/collections.h"

namespace codeloom {

class CKeyFilter {
  public:
    bool Contains(nb::handle dict, nb::handle text) {
        const uint64_t version = DictVersion(dict);
        if (version != _fVersion) [[unlikely]]
            _Learn(dict, version);
        return _MayContain(text) && DictContains(dict, text);
    }

  private:
    // The length of a text that has a place in the table; 0 for texts of other kinds.
    static size_t _PlacedLength(nb::handle text) {
        if (!PyUnicode_CheckExact(text.ptr()) || !PyUnicode_IS_COMPACT_ASCII(text.ptr())) return 0;
        const auto length = static_cast<size_t>(PyUnicode_GET_LENGTH(text.ptr()));
        return length < kMostLength ? length : 0;
    }

    static size_t _FirstCharacter(nb::handle text) { return PyUnicode_1BYTE_DATA(text.ptr())[0]; }

    bool _MayContain(nb::handle text) const {
        const size_t length = _PlacedLength(text);
        return length == 0 || (_fLengths[_FirstCharacter(text)] >> length & 1) != 0;
    }

    // A key of another kind may equal any text.
    void _Learn(nb::handle dict, uint64_t version) {
        _fLengths.fill(0);
        for (nb::handle key : nb::borrow<nb::dict>(dict).keys()) {
            const size_t length = _PlacedLength(key);
            if (length == 0) {
                _fLengths.fill(~uint64_t{0});
                break;
            }
            _fLengths[_FirstCharacter(key)] |= uint64_t{1} << length;
        }
        _fVersion = version;
    }

    static constexpr size_t kMostLength = 64;

    uint64_t _fVersion = 0;                 // of an empty dictionary, or none
    std::array<uint64_t, 128> _fLengths{};  // by first character: bit n for a key of n characters
};

}  // namespace codeloom
