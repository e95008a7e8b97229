// Names that were seen, for rules against repetition.
#pragma once

#include <algorithm>
#include <string_view>
#include <unordered_set>
#include <vector>

namespace codeloom {

// A few names are searched one by one, more of them by hash.
class CNameSet {
  public:
    // Empties the set, whose storage is reused.
    void Clear() {
        _fNames.clear();
        if (!_fMany.empty()) _fMany.clear();
    }

    // False when the name was there.
    bool Add(std::string_view name) {
        if (Has(name)) return false;
        _fNames.push_back(name);
        if (_fNames.size() > kFew) _fMany.insert(name);
        if (_fNames.size() == kFew + 1) _fMany.insert(_fNames.begin(), _fNames.end());
        return true;
    }

    bool Has(std::string_view name) const {
        if (_fNames.size() > kFew) return _fMany.contains(name);
        return std::find(_fNames.begin(), _fNames.end(), name) != _fNames.end();
    }

    // In the order in which they came.
    const std::vector<std::string_view>& Names() const { return _fNames; }

  private:
    static constexpr size_t kFew = 16;

    std::vector<std::string_view> _fNames;
    std::unordered_set<std::string_view> _fMany;  // all, once they are more than a few
};

}  // namespace codeloom
