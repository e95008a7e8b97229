// Storage of logical lines that is used again.
#pragma once

#include <iterator>
#include <utility>
#include <vector>

#include "tokenizer/raw_logical.h"

namespace codeloom {

class CSpareLogicals {
  public:
    // Adds an empty logical line to `logicals`.
    CRawLogical& AddTo(std::vector<CRawLogical>& logicals) {
        if (_fSpare.empty()) return logicals.emplace_back();
        logicals.push_back(std::move(_fSpare.back()));
        _fSpare.pop_back();
        logicals.back().tokens.clear();
        return logicals.back();
    }

    // Takes all of `logicals`.
    void TakeBack(std::vector<CRawLogical>& logicals) {
        _fSpare.insert(_fSpare.end(), std::make_move_iterator(logicals.begin()),
                       std::make_move_iterator(logicals.end()));
        logicals.clear();
    }

  private:
    std::vector<CRawLogical> _fSpare;
};

}  // namespace codeloom
