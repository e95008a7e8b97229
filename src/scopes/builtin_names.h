// The names that every module knows without binding them.
#pragma once

#include <string_view>

namespace codeloom {

// The builtins of a version of the language (312 for 3.12), and what the import system sets in a module.
bool IsBuiltinName(std::string_view name, int version);

}  // namespace codeloom
