// Whether bytes are UTF-8 text.
#pragma once

#include <string_view>

namespace codeloom {

// True for well-formed UTF-8 (Unicode, table 3-7): no surrogates, no character in more bytes than it needs.
bool IsUtf8(std::string_view bytes);

// The same without NUL, which no source can hold.
inline bool IsSourceText(std::string_view bytes) {
    return bytes.find('\0') == std::string_view::npos && IsUtf8(bytes);
}

}  // namespace codeloom
