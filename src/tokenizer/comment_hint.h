// What a type hint in a comment is: `# type: int  # and why`.
#pragma once

#include <optional>
#include <string_view>

namespace codeloom {

inline constexpr std::string_view kTypeMark = "type:";

// What follows the mark up to a further "#", with the blanks around it; it may be empty. None for a comment
// without the mark directly after a "#", and for a bare `# type: ignore`.
std::optional<std::string_view> HintInComment(std::string_view comment);

// `ignore[code]` and the like: a hint by its form that says nothing of types.
bool IsIgnoreWithMore(std::string_view hint);

}  // namespace codeloom
