// The symbols of a text, by scope and name.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <vector>

#include "scopes/scopes.h"

namespace codeloom {

class CSymbolTable {
  public:
    // Adds to `scopes`, which must outlive the table; of `name_count` names, and `expected_count` symbols
    // come without growing.
    CSymbolTable(CScopeTable& scopes, size_t name_count, size_t expected_count)
        : _fScopes(scopes), _fSlots(std::bit_ceil(expected_count + kFewSlots), 0), _fByName(name_count) {}

    // kNoIndex where there is none.
    uint32_t Find(uint32_t scope, uint32_t name) const {
        if (name >= _fByName.size()) return kNoIndex;
        if (scope == 0) return _fByName[name].of_module - 1;
        const uint32_t slot = _fSlots[_SlotOf(scope, name)];
        return slot == 0 ? kNoIndex : slot - 1;
    }

    // May move the symbols.
    uint32_t FindOrAdd(uint32_t scope, uint32_t name) {
        if (name < _fByName.size()) [[likely]] {
            const uint32_t found = scope == 0 ? _fByName[name].of_module : _fByName[name].latest;
            if (found != 0 && _fScopes.symbols[found - 1].scope == scope) return found - 1;
        }
        return _FindOrAddSlowly(scope, name);
    }

  private:
    static constexpr size_t kFewSlots = 64;

    // Of a name: index + 1, zero without one.
    struct CNewest {
        uint32_t of_module = 0;
        uint32_t latest = 0;  // of another scope; most often that is asked for next
    };

    [[gnu::noinline]] uint32_t _FindOrAddSlowly(uint32_t scope, uint32_t name) {
        if (name >= _fByName.size()) _fByName.resize(name + 1 + name / 2);
        CNewest& newest = _fByName[name];
        if (scope == 0) return (newest.of_module = _Add(scope, name)) - 1;
        const size_t slot_i = _SlotOf(scope, name);
        if (_fSlots[slot_i] == 0) {
            _fSlots[slot_i] = newest.latest = _Add(scope, name);
            if (2 * ++_fCount > _fSlots.size()) [[unlikely]]
                _Grow();
            return newest.latest - 1;
        }
        newest.latest = _fSlots[slot_i];
        return newest.latest - 1;
    }

    uint32_t _Add(uint32_t scope, uint32_t name) {
        const auto added = static_cast<uint32_t>(_fScopes.symbols.size());
        CSymbol symbol;
        symbol.name = name;
        symbol.scope = scope;
        symbol.home = added;
        _fScopes.symbols.push_back(symbol);
        _Link(_fScopes.scopes[scope], added);
        return added + 1;
    }

    // Its slot, or the free one where it would go.
    size_t _SlotOf(uint32_t scope, uint32_t name) const {
        const size_t mask = _fSlots.size() - 1;
        const uint64_t key = (uint64_t{scope} << 32 | name) * 0x9E3779B97F4A7C15u;
        for (size_t i = (key >> 32) & mask;; i = (i + 1) & mask) {
            if (_fSlots[i] == 0) return i;
            const CSymbol& symbol = _fScopes.symbols[_fSlots[i] - 1];
            if (symbol.name == name && symbol.scope == scope) return i;
        }
    }

    void _Link(CScope& scope, uint32_t symbol) {
        (scope.last_symbol == kNoIndex ? scope.first_symbol : _fScopes.symbols[scope.last_symbol].next) =
            symbol;
        scope.last_symbol = symbol;
    }

    void _Grow() {
        _fSlots.assign(2 * _fSlots.size(), 0);
        for (uint32_t i = 0; i < _fScopes.symbols.size(); ++i) {
            const CSymbol& symbol = _fScopes.symbols[i];
            if (symbol.scope != 0) _fSlots[_SlotOf(symbol.scope, symbol.name)] = i + 1;
        }
    }

    CScopeTable& _fScopes;
    // Of all scopes but the module's: open addressing, a power of two; index + 1, zero where free.
    std::vector<uint32_t> _fSlots;
    size_t _fCount = 0;  // of the taken ones
    std::vector<CNewest> _fByName;
};

}  // namespace codeloom
