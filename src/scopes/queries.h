// Questions about the names of a text. Each answer is a list of occurrences by their index, in the order of
// the text.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "scopes/text_names.h"

namespace codeloom {

// Where a name is bound.
enum class EResolution : uint8_t {
    kNone,     // it belongs to no scope: an attribute, a keyword, an origin, `*`
    kScope,    // in a scope of the text
    kBuiltin,  // nowhere in the text, but it is a builtin
    kPerhaps,  // perhaps by `import *`, or on a line with a fault
    kUnknown,  // nowhere that can be seen
};

class CNameQueries {
  public:
    // All must outlive it. The version is 312 for 3.12.
    CNameQueries(const CTextNames& names, std::string_view text, int version)
        : _fNames(names), _fText(text), _fVersion(version) {}

    EResolution Resolution(uint32_t occurrence_i) const;

    // The symbol that binds the occurrence's name, whatever scope it is of; kNoIndex without one.
    uint32_t HomeOf(uint32_t occurrence_i) const {
        const uint32_t symbol = _fNames.scopes.symbol_of[occurrence_i];
        return symbol == kNoIndex ? kNoIndex : _fNames.scopes.symbols[symbol].home;
    }

    // What covers the byte, or ends right before it; kNoIndex without one.
    uint32_t OccurrenceAt(uint32_t offset) const;

    // Where the name gets a value, in any scope.
    std::vector<uint32_t> Definitions(std::string_view name) const;

    // All of the same name that one scope binds.
    std::vector<uint32_t> References(uint32_t occurrence_i) const;

    // The first binding of each import and of each local name of a function that nothing reads; of parameters
    // if wanted.
    std::vector<uint32_t> Unused(bool with_parameters) const;

    // What is read but bound nowhere.
    std::vector<uint32_t> Undefined() const;

  private:
    struct CUses;

    bool _IsLost(uint32_t name) const;
    bool _MayBindAnyName() const;
    bool _BindsUnseen(const COccurrence& occurrence) const;
    bool _IsExtended(uint32_t occurrence_i) const;
    CUses _Uses() const;
    void _AddExported(CUses& uses, uint32_t occurrence_i) const;
    bool _MayBeUnused(uint32_t occurrence_i, const CUses& uses, bool with_parameters) const;
    bool _IsImportForOthers(uint32_t occurrence_i) const;

    const CTextNames& _fNames;
    const std::string_view _fText;
    const int _fVersion;
    mutable std::optional<bool> _fMayBindAnyName;  // known when it was first asked for
};

}  // namespace codeloom
