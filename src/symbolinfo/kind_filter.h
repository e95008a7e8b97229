// A set of kinds, one truth value for each byte.
#pragma once

#include <array>
#include <string_view>

#include "host/hosted.h"

namespace codeloom {

class CKindFilter : public CHosted {
  public:
    void Init(const nb::bytes& kinds) {
        for (const char kind : std::string_view(kinds.c_str(), kinds.size()))
            _fMatches[static_cast<unsigned char>(kind)] = true;
    }

    bool KindMatches(char kind) const { return _fMatches[static_cast<unsigned char>(kind)]; }

  private:
    std::array<bool, 256> _fMatches{};
};

}  // namespace codeloom
