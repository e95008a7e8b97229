#include "names/name_table.h"

namespace codeloom {

uint32_t CNameTable::_NumberSlowly(std::string_view text) {
    const text_hash::CEnds ends = text_hash::EndsOf(text.data(), text.size());
    for (uint32_t slot_i = HashOf(ends, text) & _fMask;; slot_i = (slot_i + 1) & _fMask) {
        const uint32_t slot = _fSlots[slot_i];
        if (slot == 0) return _Add(text, ends, slot_i);
        const bool is_same = _HasEnds(slot - 1, ends, text.size());
        if (is_same && (text.size() <= kMostInEnds || Text(slot - 1) == text)) return slot - 1;
    }
}

uint32_t CNameTable::_Add(std::string_view text, text_hash::CEnds ends, uint32_t slot_i) {
    _fEntries.push_back({ends, static_cast<uint32_t>(_fTexts.size()), static_cast<uint32_t>(text.size())});
    _fTexts += text;
    _fSlots[slot_i] = Count();
    if (Count() * 3 > _fMask) _SetSlots((_fMask + 1) * 2);
    return Count() - 1;
}

void CNameTable::Clear() {
    _fTexts.clear();
    _fEntries.clear();
    _SetSlots(kFirstSlotCount);
}

// Makes this many slots, with all names in them.
void CNameTable::_SetSlots(uint32_t count) {
    _fSlots.assign(count, 0);
    _fMask = count - 1;
    for (uint32_t number = 0; number < Count(); ++number) {
        uint32_t slot_i = HashOf(_fEntries[number].ends, Text(number)) & _fMask;
        while (_fSlots[slot_i] != 0) slot_i = (slot_i + 1) & _fMask;
        _fSlots[slot_i] = number + 1;
    }
}

}  // namespace codeloom
