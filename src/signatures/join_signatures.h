// The signatures of a text out of those of its parts.
#pragma once

#include <cstdint>

#include "signatures/signatures.h"

namespace codeloom {

class CSignatureJoiner {
  public:
    explicit CSignatureJoiner(CSignatures& joined) : _fJoined(joined) {}

    // `shift` leads from the part's places to those of the text, and `first_line` is that of the part.
    void Append(const CSignatures& part, uint32_t shift, uint32_t first_line);

  private:
    CSignatures& _fJoined;
};

}  // namespace codeloom
