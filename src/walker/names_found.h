// The names that a walk has met, until its end turns them into records.
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/text.h"

namespace codeloom {

// Names in the order first met, each once. Emptied, it keeps its memory for the next walk.
class COrderedNames {
  public:
    // The position of a name, a text string or none, which is added after the others when it is new.
    size_t Add(nb::handle text) {
        nb::object name = PlainText(text);
        const auto hash = static_cast<size_t>(nb::hash(name));
        size_t slot_i = hash & (_fSlots.size() - 1);
        for (; _fSlots[slot_i] != kFree; slot_i = (slot_i + 1) & (_fSlots.size() - 1))
            if (const uint32_t i = _fSlots[slot_i]; _IsName(i, hash, name)) return i;
        _fSlots[slot_i] = static_cast<uint32_t>(_fNames.size());
        _fNames.push_back({hash, std::move(name)});
        if (_fNames.size() * 2 > _fSlots.size()) _Grow();
        return _fNames.size() - 1;
    }

    size_t Count() const { return _fNames.size(); }
    nb::object At(size_t i) const { return _fNames[i].name; }

    void Clear() {
        if (_fNames.empty()) return;
        _fNames.clear();
        std::fill(_fSlots.begin(), _fSlots.end(), kFree);
    }

  private:
    struct CEntry {
        size_t hash;
        nb::object name;
    };

    bool _IsName(size_t i, size_t hash, nb::handle name) const {
        const CEntry& entry = _fNames[i];
        return entry.name.is(name) || (entry.hash == hash && entry.name.equal(name));
    }

    void _Grow() {
        _fSlots.assign(_fSlots.size() * 4, kFree);
        for (size_t i = 0; i < _fNames.size(); ++i) {
            size_t slot_i = _fNames[i].hash & (_fSlots.size() - 1);
            while (_fSlots[slot_i] != kFree) slot_i = (slot_i + 1) & (_fSlots.size() - 1);
            _fSlots[slot_i] = static_cast<uint32_t>(i);
        }
    }

    static constexpr uint32_t kFree = UINT32_MAX;

    std::vector<CEntry> _fNames;
    std::vector<uint32_t> _fSlots = std::vector<uint32_t>(32, kFree);  // a power of two of them
};

// Names read, and names bound within sub-expressions with their equivs.
class CNamesFound {
  public:
    void AddLoad(nb::handle name) { _fLoaded.Add(name); }

    void AddStore(nb::handle name, nb::object equiv) {
        const size_t i = _fStored.Add(name);
        if (i == _fStoredEquivs.size()) _fStoredEquivs.emplace_back();
        _fStoredEquivs[i].push_back(std::move(equiv));
    }

    // Calls visit(name). It may add names, which aren't visited any more.
    template <class Visit>
    void VisitLoads(Visit visit) const {
        const size_t count = _fLoaded.Count();
        for (size_t i = 0; i < count; ++i) visit(_fLoaded.At(i));
    }

    // Calls visit(name, equiv), equivs of one name together, in the order met.
    template <class Visit>
    void VisitStores(Visit visit) const {
        const auto equivs = _fStoredEquivs;
        for (size_t i = 0; i < equivs.size(); ++i)
            for (const nb::object& equiv : equivs[i]) visit(_fStored.At(i), equiv);
    }

    void Clear() {
        _fLoaded.Clear();
        _fStored.Clear();
        _fStoredEquivs.clear();
    }

  private:
    COrderedNames _fLoaded;
    COrderedNames _fStored;
    std::vector<std::vector<nb::object>> _fStoredEquivs;
};

}  // namespace codeloom
