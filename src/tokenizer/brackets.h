// Pairs of brackets, and which brackets are known to lack their partner.
#pragma once

#include <cstddef>
#include <vector>

#include "text/char_class.h"

namespace codeloom {

constexpr char CloserOf(char opener) {
    if (opener == '(') return ')';
    return opener == '[' ? ']' : '}';
}

// The brackets open in a logical line.
class CBrackets {
  public:
    bool AreOpen() const { return !_fOpen.empty(); }
    // The closer of the innermost bracket. Requires: AreOpen().
    char Innermost() const { return _fOpen.back().closer; }
    void Clear() { _fOpen.clear(); }

    // Takes note of the opener at `pos`; false when it is known that it will never be closed.
    bool Open(char opener, size_t pos) {
        _fOpen.push_back({pos, CloserOf(opener)});
        return _fUnclosed.empty() || !_IsKnownUnclosed(pos);
    }

    // Takes note of a closer; false when it is of the wrong kind.
    bool Close(char closer) {
        if (!AreOpen()) return true;
        if (_fOpen.back().closer != closer) return false;
        _fOpen.pop_back();
        return true;
    }

    // The open brackets will not be closed. What proves that for the innermost one proves it for those around
    // it, so that no later logical line needs to look as far again.
    void RememberUnclosed() {
        if (_IsKnownUnclosed(_fOpen.back().pos)) return;
        _fUnclosed.clear();
        _fUnclosed_i = 0;
        for (const COpenBracket& bracket : _fOpen) _fUnclosed.push_back(bracket.pos);
    }

    // It is known of no bracket at `pos` or further on that it will never be closed.
    bool KnowsNothingFrom(size_t pos) const { return _fUnclosed.empty() || _fUnclosed.back() < pos; }

  private:
    struct COpenBracket {
        size_t pos;
        char closer;
    };

    // Asked for rising positions.
    bool _IsKnownUnclosed(size_t pos) {
        while (_fUnclosed_i < _fUnclosed.size() && _fUnclosed[_fUnclosed_i] < pos) ++_fUnclosed_i;
        return _fUnclosed_i < _fUnclosed.size() && _fUnclosed[_fUnclosed_i] == pos;
    }

    std::vector<COpenBracket> _fOpen;
    std::vector<size_t> _fUnclosed;
    size_t _fUnclosed_i = 0;
};

}  // namespace codeloom
