// Names by number, each text once.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "text/text_buffer.h"
#include "text/text_hash.h"

namespace codeloom {

class CNameTable {
  public:
    // The number of a text, which is added when it is new.
    [[gnu::always_inline]] uint32_t Number(std::string_view text) {
        const uint32_t hash = HashOf(text);
        const size_t mask = _fSlots.size() - 1;
        for (size_t slot_i = hash & mask;; slot_i = (slot_i + 1) & mask) {
            const uint32_t slot = _fSlots[slot_i];
            if (slot == 0) [[unlikely]]
                return _Add(text, hash, slot_i);
            const CEntry& entry = _fEntries[slot - 1];
            if (entry.hash == hash && entry.length == text.size() &&
                AreEqual(_fTexts.data() + entry.start, text.data(), text.size())) [[likely]]
                return slot - 1;
        }
    }

    std::string_view Text(uint32_t number) const {
        const CEntry& entry = _fEntries[number];
        return {_fTexts.data() + entry.start, entry.length};
    }

    uint32_t Count() const { return static_cast<uint32_t>(_fEntries.size()); }
    void Clear();

  private:
    struct CEntry {
        uint32_t start;
        uint32_t length;
        uint32_t hash;
    };

    [[gnu::noinline]] uint32_t _Add(std::string_view text, uint32_t hash, size_t slot_i);
    void _SetSlots(size_t count);

    static constexpr size_t kFirstSlotCount = 512;

    CTextBuffer _fTexts;
    std::vector<CEntry> _fEntries;
    // Open addressing, a power of two; number + 1, zero where free.
    std::vector<uint32_t> _fSlots = std::vector<uint32_t>(kFirstSlotCount);
};

}  // namespace codeloom
