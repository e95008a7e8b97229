// The defs and classes around a logical line, as far as indentation shows.
#pragma once

#include <cstdint>
#include <vector>

#include "tokenizer/raw_logical.h"

namespace codeloom {

class CScopes {
  public:
    // Sets what the scopes say about `logical`, whose type is known and whose row is indented by `indent`,
    // and opens the scope that it begins. `is_mid_row`: it comes after another logical of the same row.
    void Visit(CRawLogical& logical, int32_t indent, bool is_mid_row);

    // Right within a class of the module, and nothing else, lies a row that is indented by `indent`.
    bool IsInClassOnly(int32_t indent) const;
    // Begins there.
    void EnterClass() { _fScopes.push_back({0, false, true}); }

  private:
    struct CScope {
        int32_t indent;
        bool is_async;
        bool is_class;
    };

    bool _IsInAsync(int32_t indent) const;

    std::vector<CScope> _fScopes;
    // The indentation of the def whose body has not begun yet, or a value that no row exceeds.
    static constexpr int32_t kNoDef = INT32_MAX;
    int32_t _fAwaitingDef = kNoDef;
};

}  // namespace codeloom
