// What was found out about node classes, at hand by the class.
#pragma once

#include <array>
#include <cstdint>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// A class has one place, which several may share: then the last one that was put there has it.
template <class Value, int slot_bits>
class CClassCache {
  public:
    // Null when nothing is at hand.
    const Value* Find(nb::handle node_class) const {
        const CEntry& entry = _fEntries[_Slot(node_class)];
        return entry.node_class == node_class.ptr() ? &entry.value : nullptr;
    }

    // `node_class` isn't kept alive: whoever puts a class here that may go sees to it that it is forgotten.
    const Value& Put(nb::handle node_class, Value value) {
        CEntry& entry = _fEntries[_Slot(node_class)];
        entry = {node_class.ptr(), std::move(value)};
        return entry.value;
    }

    void Clear() { _fEntries.fill(CEntry()); }

  private:
    struct CEntry {
        const void* node_class = nullptr;
        Value value{};
    };

    static size_t _Slot(nb::handle node_class) {
        constexpr uint64_t kSpread = 0x9E3779B97F4A7C15;  // 2^64 over the golden ratio
        return static_cast<size_t>((reinterpret_cast<uintptr_t>(node_class.ptr()) * kSpread) >>
                                   (64 - slot_bits));
    }

    std::array<CEntry, size_t{1} << slot_bits> _fEntries{};
};

}  // namespace codeloom
