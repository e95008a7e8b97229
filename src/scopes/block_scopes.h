// The scope that a block of lines belongs to.
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

#include "rules/blocks.h"

namespace codeloom {

class CBlockScopes {
  public:
    // A header that begins at the byte opens the scope. Call in the order of the file.
    void Add(uint32_t header_start, uint32_t scope) { _fHeaders.push_back({header_start, scope}); }

    // The scope of the line before.
    void Resume(uint32_t scope) { _fScope = scope; }

    // That of the innermost block whose header opens one; the module's, zero, for all others. Call for every
    // line from one of the module on.
    uint32_t ScopeOf(const CBlockTracker& tracker) {
        const std::vector<CBlock>& blocks = tracker.Blocks();
        if (&blocks.back() == blocks.data()) return _fScope = 0;
        return tracker.HaveChanged() ? _fScope = _Find(blocks) : _fScope;
    }

  private:
    struct CHeader {
        uint32_t start;
        uint32_t scope;
    };

    uint32_t _Find(const std::vector<CBlock>& blocks) {
        for (const CBlock* block = &blocks.back(); block != blocks.data(); --block) {
            const EClause clause = block->clause;
            if (clause != EClause::kDef && clause != EClause::kAsyncDef && clause != EClause::kClass)
                continue;
            if (const CHeader* const header = _Find(block->header.start)) return header->scope;
        }
        return 0;
    }

    const CHeader* _Find(uint32_t start) {
        if (_fLast < _fHeaders.size() && _fHeaders[_fLast].start == start) return &_fHeaders[_fLast];
        const auto found =
            std::lower_bound(_fHeaders.begin(), _fHeaders.end(), start,
                             [](const CHeader& header, uint32_t wanted) { return header.start < wanted; });
        if (found == _fHeaders.end() || found->start != start) return nullptr;
        _fLast = static_cast<size_t>(found - _fHeaders.begin());
        return &*found;
    }

    std::vector<CHeader> _fHeaders;
    uint32_t _fScope = 0;  // of the line before
    size_t _fLast = 0;     // what is asked for next is most often the same
};

}  // namespace codeloom
