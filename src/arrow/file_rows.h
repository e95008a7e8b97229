// Rows about files of a batch.
#pragma once

#include "arrow/columns.h"

namespace codeloom {

enum class EFileState : uint8_t {
    kOk,
    kUnreadable,
    kTooBig,
    kTooSlow,
    kMissing,
    kUnknownVersion,
    kDuplicate
};

template <>
struct TKindWords<EFileState> : CWordsFromFirst {
    static constexpr auto kWords = std::to_array<std::string_view>(
        {"ok", "unreadable", "too big", "too slow", "missing", "unknown version", "duplicate"});
};

struct CFileRow {
    int64_t file_id;
    std::string_view path;
    std::optional<std::string_view> sha256;
    std::optional<int64_t> bytes;
    CRepeated python;
    EFileState state;
    std::optional<std::string_view> reason;
    std::optional<uint32_t> rows;
    std::optional<uint32_t> lines;
    std::optional<uint32_t> problems;
};

const TColumns<CFileRow>& FileColumns();

}  // namespace codeloom
