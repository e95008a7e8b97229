// The words for the kinds of what an analysis gives: what hosts see as members of enums and in tables.
#pragma once

#include <array>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "file/file_analysis.h"
#include "names/record_kinds.h"
#include "scopes/queries.h"

namespace codeloom {

// `kWords` are in the order of the numbers, the first of which is `kFirst`.
template <class Kind>
struct TKindWords;

template <class Kind>
constexpr std::span<const std::string_view> WordsOf() {
    return TKindWords<Kind>::kWords;
}

// The index of a kind's word.
template <class Kind>
constexpr size_t NumberOf(Kind kind) {
    return static_cast<size_t>(kind) - TKindWords<Kind>::kFirst;
}

template <class Kind>
constexpr std::string_view WordOf(Kind kind) {
    return TKindWords<Kind>::kWords[NumberOf(kind)];
}

// Of a problem.
enum class ESeverity : uint8_t { kError, kWarning };

constexpr ESeverity SeverityOf(ECode code) {
    return IsWarning(code) ? ESeverity::kWarning : ESeverity::kError;
}

// "CL201"
inline std::string CodeText(ECode code) {
    return "CL" + std::to_string(static_cast<int>(code));
}

// The index of a record's kind in kRecordKinds.
enum class ERecordKind : uint8_t {};

inline ERecordKind RecordKindOf(char kind) {
    static const std::array<uint8_t, 256> numbers = [] {
        std::array<uint8_t, 256> by_byte{};
        for (size_t i = 0; i < kRecordKinds.size(); ++i)
            by_byte[static_cast<unsigned char>(kRecordKinds[i].kind)] = static_cast<uint8_t>(i);
        return by_byte;
    }();
    return static_cast<ERecordKind>(numbers[static_cast<unsigned char>(kind)]);
}

struct CWordsFromFirst {
    static constexpr size_t kFirst = 0;
};

// The kind "none" of some has no word.
struct CWordsAfterNone {
    static constexpr size_t kFirst = 1;
};

#define CODELOOM_SECOND(first, second, ...) second,

template <>
struct TKindWords<ELogicalType> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>({CODELOOM_LOGICAL_TYPES(CODELOOM_SECOND)});
};

template <>
struct TKindWords<ERole> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>({CODELOOM_ROLES(CODELOOM_SECOND)});
};

template <>
struct TKindWords<EScopeKind> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>({CODELOOM_SCOPE_KINDS(CODELOOM_SECOND)});
};

template <>
struct TKindWords<EParameterKind> : CWordsFromFirst {
    static constexpr auto kWords =
        std::to_array<std::string_view>({CODELOOM_PARAMETER_KINDS(CODELOOM_SECOND)});
};

template <>
struct TKindWords<EHintKind> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>({CODELOOM_HINT_KINDS(CODELOOM_SECOND)});
};

#undef CODELOOM_SECOND

template <>
struct TKindWords<ESeverity> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>({"error", "warning"});
};

template <>
struct TKindWords<ELimit> : CWordsAfterNone {
    static constexpr auto kWords = std::to_array<std::string_view>({"too many nodes", "too deep"});
};

template <>
struct TKindWords<EResolution> : CWordsAfterNone {
    static constexpr auto kWords =
        std::to_array<std::string_view>({"scope", "builtin", "perhaps", "unknown"});
};

template <>
struct TKindWords<ERecordKind> : CWordsFromFirst {
    static constexpr auto kWords = [] {
        std::array<std::string_view, kRecordKinds.size()> words;
        for (size_t i = 0; i < words.size(); ++i) words[i] = kRecordKinds[i].word;
        return words;
    }();
};

}  // namespace codeloom
