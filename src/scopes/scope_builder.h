// Scopes and symbols out of the names of a text's lines.
#pragma once

#include "scopes/text_names.h"

namespace codeloom {

// Fills `names.scopes`, which must be empty, out of all else that is there.
void BuildScopes(CTextNames& names);

}  // namespace codeloom
