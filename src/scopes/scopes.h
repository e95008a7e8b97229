// Scopes and their symbols, as plain data.
#pragma once

#include <cstdint>

#include "occurrences/occurrences.h"
#include "text/plain_array.h"

namespace codeloom {

inline constexpr uint32_t kNoIndex = UINT32_MAX;

// A name in a scope. What the flags say is what the interpreter's own table says (module `symtable`).
struct CSymbol {
    enum EFlag : uint16_t {
        kIsReferenced = 1,
        kIsAssigned = 2,  // by anything but an import, and not only as a parameter
        kIsParameter = 4,
        kIsImported = 8,
        kIsAnnotated = 16,
        kIsDeclaredGlobal = 32,
        kIsDeclaredNonlocal = 64,
        kIsTypeParameter = 128,
        kIsNamespace = 256,        // of a scope right within this one
        kIsPassedOn = 512,         // used by a scope within only, and bound by one around
        kIsBoundElsewhere = 1024,  // by a function that declares it global, or on a line with a fault
        kIsBound = kIsAssigned | kIsParameter | kIsImported | kIsTypeParameter,
    };

    // Where the name is looked up.
    enum class EBinding : uint8_t { kLocal, kFree, kGlobalImplicit, kGlobalExplicit };

    uint32_t name = 0;  // in the table of names, as the interpreter mangles it
    uint32_t scope = 0;
    uint32_t next = kNoIndex;  // of the same scope
    uint32_t home = kNoIndex;  // the symbol of the scope that binds the name, itself for a local one; for a
                               // name that nothing binds, the module's
    uint16_t flags = 0;
    EBinding binding = EBinding::kLocal;

    bool Is(EFlag flag) const { return (flags & flag) != 0; }
    // As the module `symtable` answers; the module is scope zero.
    bool IsGlobal() const {
        return binding == EBinding::kGlobalImplicit || binding == EBinding::kGlobalExplicit ||
               (scope == 0 && (flags & kIsBound) != 0);
    }
    bool IsLocal() const { return binding == EBinding::kLocal || (scope == 0 && (flags & kIsBound) != 0); }
    bool MayBeBound() const { return (flags & (kIsBound | kIsBoundElsewhere)) != 0; }
    // False for a global name that the module itself doesn't mention.
    bool IsMentioned() const { return flags != 0 && flags != kIsBoundElsewhere; }
};

// In the order of the source, the module first; a scope comes after the one around it.
struct CScope {
    EScopeKind kind = EScopeKind::kModule;
    bool is_lost = false;          // its header has a fault
    bool is_text = false;          // annotations that are kept as text
    bool is_of_class = false;      // type parameters of a class
    bool has_lost_lines = false;   // a line right in it has a fault
    bool has_star_import = false;  // it may bind any name
    uint32_t name = 0;             // in the table of names
    uint32_t parent = 0;
    uint32_t start = 0;  // bytes of the file
    uint32_t end = 0;
    uint32_t first_symbol = kNoIndex;
    uint32_t last_symbol = kNoIndex;
};

struct CScopeTable {
    TPlainArray<CScope> scopes;
    TPlainArray<CSymbol> symbols;
    TPlainArray<uint32_t> symbol_of;  // by occurrence; kNoIndex for names that belong to no scope
};

}  // namespace codeloom
