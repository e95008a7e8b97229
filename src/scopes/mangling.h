// Names that the interpreter mangles within a class: `__x` in class A is `_A__x`.
#pragma once

#include <algorithm>
#include <string>
#include <string_view>

namespace codeloom {

// `__a`, but not `__a__`.
inline bool IsPrivate(std::string_view name) {
    return name.starts_with("__") && !name.ends_with("__");
}

// A private name as a class mangles it: one whose name is all underscores leaves it as it is.
inline std::string MangledName(std::string_view name, std::string_view class_name) {
    class_name.remove_prefix(std::min(class_name.find_first_not_of('_'), class_name.size()));
    if (class_name.empty()) return std::string(name);
    return "_" + std::string(class_name) + std::string(name);
}

}  // namespace codeloom
