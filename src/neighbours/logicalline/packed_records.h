// Records of a logical line as plain bytes in one block.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>

#include "names/records.h"

namespace codeloom {

class CPackedRecords {
  public:
    CPackedRecords() = default;

    // Those of arguments, or all others, from `first` up to `end`.
    CPackedRecords(const CRecords& records, size_t first, size_t end, bool of_arg);

    bool IsEmpty() const { return _fSize == 0; }

    // Calls visit(name, equiv) for each record, both as UTF-8, the prefix of the equiv included.
    template <class Visit>
    void ForEach(Visit visit) const {
        for (size_t pos = 0; pos < _fSize;) {
            CLengths lengths;
            std::memcpy(&lengths, _fBytes.get() + pos, sizeof lengths);
            const char* const name = _fBytes.get() + pos + sizeof lengths;
            visit(std::string_view(name, lengths.name), std::string_view(name + lengths.name, lengths.equiv));
            pos += sizeof lengths + lengths.name + lengths.equiv;
        }
    }

  private:
    // Before the bytes of each record.
    struct CLengths {
        uint32_t name;
        uint32_t equiv;
    };

    static CLengths _LengthsOf(const CRecord& record, const CRecords& records);

    std::unique_ptr<char[]> _fBytes;
    size_t _fSize = 0;
};

}  // namespace codeloom
