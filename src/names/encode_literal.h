// String literals as records show them.
#pragma once

#include <string>
#include <string_view>

namespace codeloom {

// The text of a string literal with its prefix and quotes on one row: what ends rows is written as an escape,
// and a continued row is joined. So the value is the same, but for raw strings, which have no escapes. The
// result is `text` itself where nothing ends rows, otherwise it lies in `storage`.
std::string_view EncodeStringLiteral(std::string_view text, std::string& storage);

// True when it holds only characters that can't be mistaken for anything but the contents of a string and its
// quotes. No such character ends rows.
bool IsHarmlessLiteral(std::string_view literal);

}  // namespace codeloom
