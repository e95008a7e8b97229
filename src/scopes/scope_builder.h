// Scopes and symbols out of the names of a text's lines.
#pragma once

#include <span>

#include "scopes/text_names.h"

namespace codeloom {

// Fills `names.scopes`; `lost_lines` are those with a fault.
void BuildScopes(CTextNames& names, std::span<const uint32_t> lost_lines);

}  // namespace codeloom
