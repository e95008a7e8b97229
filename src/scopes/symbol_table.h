// The symbols of a text, by scope and name.
#pragma once

#include <bit>
#include <cstdint>
#include <vector>

#include "scopes/scopes.h"

namespace codeloom {

class CSymbolTable {
  public:
    // Adds to `scopes`, which must outlive the table; `expected_count` symbols come without growing.
    CSymbolTable(CScopeTable& scopes, size_t expected_count)
        : _fScopes(scopes), _fSlots(std::bit_ceil(expected_count + kFewSlots), 0) {}

    // kNoIndex where there is none.
    uint32_t Find(uint32_t scope, uint32_t name) const {
        const uint32_t slot = _fSlots[_SlotOf(scope, name)];
        return slot == 0 ? kNoIndex : slot - 1;
    }

    // May move the symbols.
    uint32_t FindOrAdd(uint32_t scope, uint32_t name) {
        const size_t slot_i = _SlotOf(scope, name);
        if (_fSlots[slot_i] != 0) return _fSlots[slot_i] - 1;
        const auto added = static_cast<uint32_t>(_fScopes.symbols.size());
        CSymbol symbol;
        symbol.name = name;
        symbol.scope = scope;
        symbol.home = added;
        _fScopes.symbols.push_back(symbol);
        _Link(_fScopes.scopes[scope], added);
        _fSlots[slot_i] = added + 1;
        if (2 * _fScopes.symbols.size() > _fSlots.size()) [[unlikely]]
            _Grow();
        return added;
    }

  private:
    static constexpr size_t kFewSlots = 64;

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
        for (uint32_t i = 0; i < _fScopes.symbols.size(); ++i)
            _fSlots[_SlotOf(_fScopes.symbols[i].scope, _fScopes.symbols[i].name)] = i + 1;
    }

    CScopeTable& _fScopes;
    std::vector<uint32_t> _fSlots;  // open addressing, a power of two; index + 1, zero where free
};

}  // namespace codeloom
