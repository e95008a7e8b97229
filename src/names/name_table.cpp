#include "names/name_table.h"

namespace codeloom {

uint32_t CNameTable::_Add(std::string_view text, uint32_t hash, size_t slot_i) {
    _fEntries.push_back({static_cast<uint32_t>(_fTexts.size()), static_cast<uint32_t>(text.size()), hash});
    _fTexts += text;
    _fSlots[slot_i] = Count();
    if (_fEntries.size() * 2 > _fSlots.size()) _SetSlots(_fSlots.size() * 2);
    return Count() - 1;
}

void CNameTable::Clear() {
    _fTexts.clear();
    _fEntries.clear();
    _SetSlots(kFirstSlotCount);
}

// So many slots, with all names in them.
void CNameTable::_SetSlots(size_t count) {
    _fSlots.assign(count, 0);
    for (uint32_t number = 0; number < Count(); ++number) {
        size_t slot_i = _fEntries[number].hash & (count - 1);
        while (_fSlots[slot_i] != 0) slot_i = (slot_i + 1) & (count - 1);
        _fSlots[slot_i] = number + 1;
    }
}

}  // namespace codeloom
