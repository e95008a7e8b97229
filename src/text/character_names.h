// The names that characters have in Unicode, as `\N{...}` holds them.
#pragma once

#include <string_view>

namespace codeloom {

// False for what is surely no name or alias of a character; true for all of them, and for about one in a
// thousand other texts. Case doesn't matter.
bool MayBeCharacterName(std::string_view name);

}  // namespace codeloom
