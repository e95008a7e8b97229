// Whether bytes are UTF-8 text.
#pragma once

#include <string_view>

namespace codeloom {

// True for well-formed UTF-8 (Unicode, table 3-7): no surrogates, no character in more bytes than it needs.
bool IsUtf8(std::string_view bytes);

}  // namespace codeloom
