// The names that a walk has met, until its end turns them into records.
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

#include "syntax/nodes.h"
#include "text/plain_array.h"

namespace codeloom {

// Names by number. What was noted of one line is forgotten by counting lines, not by clearing.
class CNameNotes {
  public:
    struct CLoad {
        uint32_t name;
        CSpan place;  // the first one
    };
    struct CStore {
        uint32_t name;
        uint32_t token;
        CSpan place;
        uint32_t rank;  // of the name, in the order first met
    };

    void BeginLine() {
        _fLoads.clear();
        _fStores.clear();
        if (++_fLine == 0) [[unlikely]] {  // the count of lines starts anew
            _fLinesOfLoads.clear();
            _fStamps.clear();
            _fLine = 1;
        }
    }

    void AddLoad(uint32_t name, CSpan place) {
        if (name >= _fLinesOfLoads.size()) [[unlikely]]
            _fLinesOfLoads.resize(2 * size_t{name} + 64);
        if (_fLinesOfLoads[name] == _fLine) return;
        _fLinesOfLoads[name] = _fLine;
        _fLoads.push_back({name, place});
    }

    [[gnu::noinline]] void AddStore(uint32_t name, uint32_t token, CSpan place) {
        if (name >= _fStamps.size()) _fStamps.resize(2 * size_t{name} + 64);
        CStamp& stamp = _fStamps[name];
        if (stamp.line != _fLine) stamp = {_fLine, static_cast<uint32_t>(_fStores.size())};
        _fStores.push_back({name, token, place, stamp.rank});
    }

    // Names read, each once, in the order first met.
    const TPlainArray<CLoad>& Loads() const { return _fLoads; }

    // Names bound within sub-expressions, those of one name together.
    const TPlainArray<CStore>& SortedStores() {
        const auto is_earlier = [](const CStore& a, const CStore& b) { return a.rank < b.rank; };
        if (!std::is_sorted(_fStores.begin(), _fStores.end(), is_earlier))
            std::stable_sort(_fStores.begin(), _fStores.end(), is_earlier);
        return _fStores;
    }

  private:
    struct CStamp {
        uint32_t line = 0;
        uint32_t rank = 0;
    };

    TPlainArray<CLoad> _fLoads;
    TPlainArray<CStore> _fStores;
    std::vector<uint32_t> _fLinesOfLoads;  // by name, the last line that read it
    std::vector<CStamp> _fStamps;          // by name, the last line that bound it so
    uint32_t _fLine = 0;
};

}  // namespace codeloom
