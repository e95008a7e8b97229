// symbolinfo/: the vocabulary of what is recorded about names.
//   in     records, kinds and scopes
//   out    answers about them
//   keeps  nothing
//   start  at the table in names/record_kinds.h; constants here, questions in predicates.h
#pragma once

#include <string_view>

#include "names/record_kinds.h"

namespace codeloom {

// Scopes are dotted names; the module's own is empty. After a name the separator and a number say which
// definition of that name in its scope is meant, counted from zero.
inline constexpr std::string_view kScopeIndexSep = "#";
inline constexpr std::string_view kModuleScopeName;
inline constexpr std::string_view kWildcardScope = "*";
inline constexpr std::string_view kDefLineScopeName = "<def>";  // the scope of a def line itself
inline constexpr std::string_view _kDotLineScopeName = ".<def>";

inline constexpr std::string_view kTypingModuleSymbol = "typing";
inline constexpr std::string_view kTypingModuleSymbolDot = "typing.";
inline constexpr std::string_view kTypingModuleSymbolDotAny = "typing.Any";

}  // namespace codeloom
