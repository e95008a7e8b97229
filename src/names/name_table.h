// Names by number, each text once.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "text/plain_array.h"
#include "text/text_buffer.h"
#include "text/text_hash.h"

namespace codeloom {

class CNameTable {
  public:
    // The number of a text, which is added when it is new.
    [[gnu::noinline]] uint32_t Number(std::string_view text) {
        if (text.size() <= kMostInEnds) [[likely]] {
            const text_hash::CEnds ends = text_hash::EndsOf(text.data(), text.size());
            const uint32_t slot = _fSlots[HashOf(ends, text.size()) & _fMask];
            if (slot != 0 && _HasEnds(slot - 1, ends, text.size())) [[likely]]
                return slot - 1;
        }
        return _NumberSlowly(text);
    }

    std::string_view Text(uint32_t number) const {
        const CEntry& entry = _fEntries[number];
        return {_fTexts.data() + entry.start, entry.length};
    }

    uint32_t Count() const { return static_cast<uint32_t>(_fEntries.size()); }
    void Clear();

  private:
    struct CEntry {
        text_hash::CEnds ends;
        uint32_t start;
        uint32_t length;
    };

    bool _HasEnds(uint32_t number, text_hash::CEnds ends, size_t length) const {
        const CEntry& entry = _fEntries[number];
        return entry.ends == ends && entry.length == length;
    }
    [[gnu::noinline]] uint32_t _NumberSlowly(std::string_view text);
    uint32_t _Add(std::string_view text, text_hash::CEnds ends, uint32_t slot_i);
    void _SetSlots(uint32_t count);

    static constexpr uint32_t kFirstSlotCount = 512;

    CTextBuffer _fTexts;
    TPlainArray<CEntry> _fEntries;
    // Open addressing, a power of two; number + 1, zero where free.
    std::vector<uint32_t> _fSlots = std::vector<uint32_t>(kFirstSlotCount);
    uint32_t _fMask = kFirstSlotCount - 1;
};

}  // namespace codeloom
